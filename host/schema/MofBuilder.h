#pragma once

#include <functional>
#include <map>
#include <string>

#include "cim/Names.h"
#include "schema/LiteralGrammar.h"
#include "schema/Schema.h"

namespace cimhost {

/** Adds the classes, qualifier declarations and instances of a MOF parse tree to a schema. */
class MofBuilder {
public:
    /** Called for each #pragma include, in order. */
    using Include = std::function<void(const std::string& file)>;

    MofBuilder(Schema& target, Include onInclude) : schema(target), include(std::move(onInclude)) {}

    /** Builds all declarations below the root, in order. @throws LoadError with file, line and column of the first
     * error */
    void build(const grammar::Node& root);

private:
    void buildDeclaration(const grammar::Node& node);
    void buildPragma(const grammar::Node& pragma);
    void buildQualifierDeclaration(const grammar::Node& node);
    void buildClass(const grammar::Node& node, const grammar::Node* qualifiers);
    void buildFeature(Class& declared, const grammar::Node& feature) const;
    void buildInstance(const grammar::Node& node);
    NamedValue buildAssignment(const grammar::Node& assignment, const Class& declared) const;

    /** Name, type and qualifiers of a property or a parameter. */
    Property readTypedName(const std::string& name, const grammar::Node& node) const;
    std::vector<Qualifier> readQualifiers(const grammar::Node* list) const;
    Qualifier readQualifier(const grammar::Node& node) const;
    Value readValue(const grammar::Node& initializer, const Property& type) const;
    Scalar readElement(const grammar::Node& constant, const Property& type) const;

    Schema& schema;  ///< not owned
    Include include;
    std::map<std::string, ObjectPath, cim::NameLess> aliases{};
};

/** The literal of a MOF constant. Adjacent strings are joined. An alias results in NULL. */
Literal constantLiteral(const grammar::Node& constant);

}  // namespace cimhost
