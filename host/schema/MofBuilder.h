#pragma once

#include <functional>
#include <map>
#include <string>

#include "cim/Names.h"
#include "schema/LiteralGrammar.h"
#include "schema/Schema.h"

namespace cimhost {

/** Turns the parse tree of a MOF text into classes, qualifier declarations and instances of a schema. */
class MofBuilder {
public:
    /** Called for every #pragma include, in its place. */
    using Include = std::function<void(const std::string& file)>;

    MofBuilder(Schema& target, Include onInclude) : schema(target), include(std::move(onInclude)) {}

    /** Builds everything below the root, in order. LoadError with file, line and column at the first mistake. */
    void build(const grammar::Node& root);

private:
    void buildDeclaration(const grammar::Node& node);
    void buildPragma(const grammar::Node& pragma);
    void buildQualifierDeclaration(const grammar::Node& node);
    void buildClass(const grammar::Node& node, const grammar::Node* qualifiers);
    void buildFeature(Class& declared, const grammar::Node& feature) const;
    void buildInstance(const grammar::Node& node);
    NamedValue buildAssignment(const grammar::Node& assignment, const Class& declared) const;

    std::vector<Qualifier> readQualifiers(const grammar::Node* list) const;
    Qualifier readQualifier(const grammar::Node& node) const;
    Value readValue(const grammar::Node& initializer, const Property& type) const;
    Scalar readElement(const grammar::Node& constant, const Property& type) const;

    Schema& schema;  ///< not owned
    Include include;
    std::map<std::string, ObjectPath, cim::NameLess> aliases{};
};

}  // namespace cimhost
