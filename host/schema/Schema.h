#pragma once

#include <array>
#include <bitset>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "cim/Names.h"
#include "model/Value.h"

namespace cimhost {

/** Whether a qualifier is inherited, and whether subclasses can override it. */
struct Flavor {
    bool toSubclass = true;   ///< inherited by subclasses and overriding properties
    bool overridable = true;  ///< subclasses can change its value
    bool translatable = false;
};

/** A qualifier of a class, property, method or parameter, declared there or inherited. */
struct Qualifier {
    std::string name{};
    Value value{};
    Flavor flavor{};
    bool isPropagated = false;  ///< inherited from a superclass, not declared
};

/** Whether a qualifier exists and is true. */
bool isTrue(const Qualifier* qualifier);

/** Kinds of elements that a qualifier can apply to, with their names in CIM-XML. */
constexpr std::array<std::string_view, 7> scopeNames{"CLASS",  "ASSOCIATION", "REFERENCE", "PROPERTY",
                                                     "METHOD", "PARAMETER",   "INDICATION"};

/** A set of these kinds, by their position in scopeNames. */
using Scope = std::bitset<scopeNames.size()>;

/** Declaration of a qualifier. */
struct QualifierDeclaration {
    std::string name{};
    CMPIType type = CMPI_boolean;
    bool isArray = false;
    Value defaultValue{};
    Flavor flavor{};
    Scope scope{};
    bool standard = false;  ///< declared by the CIM standard; a MOF file can declare it again
};

/** Declarations of the CIM standard's qualifiers, which MOF files may use without declaring them. */
std::vector<QualifierDeclaration> standardQualifiers();

/** A property or reference of a class. */
struct Property {
    std::string name{};
    CMPIType type = CMPI_null;  ///< element type; CMPI_ref for a reference
    bool isArray = false;
    std::string referenceClass{};  ///< of a reference, the class that it refers to; empty otherwise
    Value defaultValue{};          ///< of the property's type; null if there is no default
    std::vector<Qualifier> qualifiers{};
    std::string origin{};       ///< name of the class that declares it first
    bool isPropagated = false;  ///< inherited and not overridden

    const Qualifier* findQualifier(std::string_view qualifier) const { return cim::findNamed(qualifiers, qualifier); }
    bool isKey() const { return isTrue(findQualifier("Key")); }

    /** Whether clients can modify the property: its Write qualifier is true. */
    bool isWritable() const { return isTrue(findQualifier("Write")); }
};

/** A method with its parameters. This host does not call methods. */
struct Method {
    std::string name{};
    std::string origin{};
    bool isPropagated = false;
    CMPIType type = CMPI_null;  ///< of the return value
    std::vector<Qualifier> qualifiers{};
    std::vector<Property> parameters{};
};

/** A class with all its properties: first the inherited ones, also if overridden, then the others. */
struct Class {
    std::string name{};
    std::string superclass{};  ///< empty: none
    std::vector<Qualifier> qualifiers{};
    std::vector<Property> properties{};
    std::vector<Method> methods{};

    const Property* findProperty(std::string_view property) const { return cim::findNamed(properties, property); }
    const Qualifier* findQualifier(std::string_view qualifier) const { return cim::findNamed(qualifiers, qualifier); }
    std::vector<const Property*> keys() const;
    bool isAssociation() const { return isTrue(findQualifier("Association")); }
};

/**
 * The classes, qualifier declarations and instances of MOF files, for all namespaces. Names are case-insensitive.
 * Pointers and references to classes are valid for the lifetime of the schema. Concurrent reading is safe.
 */
class Schema {
public:
    /** Creates a schema with the standard qualifiers. */
    Schema();

    /** The class of this name, or null. */
    const Class* findClass(std::string_view name) const;

    /** All classes in the order in which they were added. Adding a class invalidates iterators. */
    const std::vector<const Class*>& classes() const { return inOrder; }

    /** Whether a class is the ancestor or derived from it. An unknown class has no ancestors. */
    bool isA(std::string_view name, std::string_view ancestor) const;

    /** The direct and indirect subclasses of a class, in the order in which they were added. */
    std::vector<const Class*> subclasses(std::string_view name) const;

    /**
     * Adds a class and the elements that it inherits.
     * @param declared the class, with only the properties and methods that it declares
     * @throws std::invalid_argument if the class exists, its superclass does not, a property is declared twice, or an
     * overriding property has another type
     */
    const Class& add(Class declared);

    const QualifierDeclaration* findQualifier(std::string_view name) const;

    /** All qualifier declarations, sorted by name. */
    std::vector<const QualifierDeclaration*> qualifiers() const;

    /**
     * Adds a declaration, or replaces a standard one.
     * @throws std::invalid_argument if a declaration that is not standard has the same name
     */
    void add(QualifierDeclaration declaration);

    /** The instances of MOF files ("instance of"), in order. */
    const std::vector<Instance>& instances() const { return declaredInstances; }
    void add(Instance instance) { declaredInstances.push_back(std::move(instance)); }

private:
    std::map<std::string, std::unique_ptr<const Class>, cim::NameLess> byName;
    std::vector<const Class*> inOrder;
    std::map<std::string, QualifierDeclaration, cim::NameLess> qualifierDeclarations;
    std::vector<Instance> declaredInstances;
};

}  // namespace cimhost
