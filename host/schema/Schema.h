#pragma once

#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "cim/Names.h"
#include "model/Value.h"

namespace cimhost {

/** How a qualifier travels to subclasses and whether they may change it. */
struct Flavor {
    bool toSubclass = true;   ///< inherited by subclasses and overriding properties
    bool overridable = true;  ///< may be given another value there
    bool translatable = false;
};

/** A qualifier as a class, property or method bears it, its own or inherited. */
struct Qualifier {
    std::string name{};
    Value value{};
    Flavor flavor{};
};

/** Declaration of a qualifier: what type its values have and what holds where none is given. */
struct QualifierDeclaration {
    std::string name{};
    CMPIType type = CMPI_boolean;
    bool isArray = false;
    Value defaultValue{};
    Flavor flavor{};
    bool standard = false;  ///< known to every object manager; a MOF file may still declare it
};

/** A property or reference of a class. */
struct Property {
    std::string name{};
    CMPIType type = CMPI_null;  ///< element type; CMPI_ref for a reference
    bool isArray = false;
    std::string referenceClass{};  ///< class that a reference points to; empty otherwise
    Value defaultValue{};          ///< of the property's type; null without a default
    std::vector<Qualifier> qualifiers{};
    std::string origin{};  ///< name of the class that declares it

    const Qualifier* findQualifier(std::string_view qualifier) const;
    bool isKey() const;

    /** Whether clients may modify it: the qualifier Write is true. */
    bool isWritable() const;
};

/** A method by its name; this host does not call methods. */
struct Method {
    std::string name{};
    std::string origin{};
};

/** A class with all its properties: the inherited ones first, then its own, each in the order declared. */
struct Class {
    std::string name{};
    std::string superclass{};  ///< empty at the root
    std::vector<Qualifier> qualifiers{};
    std::vector<Property> properties{};
    std::vector<Method> methods{};

    const Property* findProperty(std::string_view property) const;
    const Qualifier* findQualifier(std::string_view qualifier) const;
    std::vector<const Property*> keys() const;
    bool isAssociation() const;
};

/**
 * The classes, qualifier declarations and instances that MOF files have given. One set for all
 * namespaces. Names ignore letter case. Pointers and references to classes stay good as long as the
 * schema lives. Not synchronised: fill it, then share it for reading.
 */
class Schema {
public:
    /** Knows the standard qualifiers from the start. */
    Schema();

    /** The class of that name, or null. */
    const Class* findClass(std::string_view name) const;

    /** All classes in the order in which they were added. */
    std::vector<const Class*> classes() const;

    /** Whether the class is the other one or descends from it. A class that is not known is only itself. */
    bool isA(std::string_view name, std::string_view ancestor) const;

    /** The class's direct and indirect subclasses, itself not among them, in the order added. */
    std::vector<const Class*> subclasses(std::string_view name) const;

    /**
     * Adds a class that carries only its own properties and methods, and completes it with what it inherits.
     * std::invalid_argument when the class is there already, the superclass is not, a property comes twice,
     * or an overriding property has another type.
     */
    const Class& add(Class declared);

    const QualifierDeclaration* findQualifier(std::string_view name) const;

    /** Adds a declaration; a standard one may be given again, any other with the same name is std::invalid_argument. */
    void add(QualifierDeclaration declaration);

    /** Instances that MOF files declare ("instance of"), in order. */
    const std::vector<Instance>& instances() const { return declaredInstances; }
    void add(Instance instance) { declaredInstances.push_back(std::move(instance)); }

private:
    std::map<std::string, std::unique_ptr<const Class>, cim::NameLess> byName;
    std::vector<const Class*> inOrder;
    std::map<std::string, QualifierDeclaration, cim::NameLess> qualifierDeclarations;
    std::vector<Instance> declaredInstances;
};

}  // namespace cimhost
