#include "schema/Schema.h"

#include <algorithm>
#include <stdexcept>

namespace cimhost {
namespace {

using cim::findNamed;

void inheritQualifiers(std::vector<Qualifier>& own, const std::vector<Qualifier>& inherited) {
    for (const Qualifier& qualifier : inherited) {
        if (qualifier.flavor.toSubclass && findNamed(own, qualifier.name) == nullptr) {
            own.push_back(qualifier);
            own.back().isPropagated = true;
        }
    }
}

/** Marks an inherited property or method, and its qualifiers, as propagated. */
template <class Element>
void markPropagated(Element& inherited) {
    inherited.isPropagated = true;
    for (Qualifier& qualifier : inherited.qualifiers) {
        qualifier.isPropagated = true;
    }
}

std::string typeOf(const Property& property) {
    return (property.type == CMPI_ref ? property.referenceClass + " REF" : std::string(typeName(property.type))) +
           (property.isArray ? "[]" : "");
}

void checkOverride(const Class& declared, const Property& own, const Property& inherited) {
    if (own.type != inherited.type || own.isArray != inherited.isArray) {
        throw std::invalid_argument("property " + declared.name + "." + own.name + " is " + typeOf(own) + ", but " +
                                    inherited.origin + " declares it as " + typeOf(inherited));
    }
}

void checkUnique(const Class& declared) {
    for (const Property& each : declared.properties) {
        if (findNamed(declared.properties, each.name) != &each) {
            throw std::invalid_argument("class " + declared.name + " declares the property " + each.name + " twice");
        }
    }
}

/** The properties of the superclass, overridden by those of the class, then the other properties of the class. */
std::vector<Property> mergeProperties(const Class& declared, const Class& super) {
    std::vector<Property> merged = super.properties;
    for (Property& inherited : merged) {
        markPropagated(inherited);
    }
    for (const Property& own : declared.properties) {
        Property* inherited = findNamed(merged, own.name);
        if (inherited == nullptr) {
            merged.push_back(own);
            continue;
        }
        checkOverride(declared, own, *inherited);
        Property overriding = own;
        overriding.origin = inherited->origin;
        inheritQualifiers(overriding.qualifiers, inherited->qualifiers);
        *inherited = std::move(overriding);
    }
    return merged;
}

std::vector<Method> mergeMethods(const Class& declared, const Class& super) {
    std::vector<Method> merged = declared.methods;
    for (const Method& inherited : super.methods) {
        if (Method* overriding = findNamed(merged, inherited.name)) {
            overriding->origin = inherited.origin;
            inheritQualifiers(overriding->qualifiers, inherited.qualifiers);
            continue;
        }
        merged.push_back(inherited);
        markPropagated(merged.back());
    }
    return merged;
}

}  // namespace

bool isTrue(const Qualifier* qualifier) {
    if (qualifier == nullptr || qualifier->value.isNull) {
        return false;
    }
    const bool* value = std::get_if<bool>(&qualifier->value.single);
    return value != nullptr && *value;
}

std::vector<const Property*> Class::keys() const {
    std::vector<const Property*> found;
    for (const Property& property : properties) {
        if (property.isKey()) {
            found.push_back(&property);
        }
    }
    return found;
}

Schema::Schema() {
    for (QualifierDeclaration& declaration : standardQualifiers()) {
        qualifierDeclarations.emplace(declaration.name, declaration);
    }
}

const Class* Schema::findClass(std::string_view name) const {
    const auto found = byName.find(name);
    return found == byName.end() ? nullptr : found->second.get();
}

bool Schema::isA(std::string_view name, std::string_view ancestor) const {
    if (cim::sameName(name, ancestor)) {
        return true;
    }
    const Class* known = findClass(name);
    return known != nullptr && !known->superclass.empty() && isA(known->superclass, ancestor);
}

std::vector<const Class*> Schema::subclasses(std::string_view name) const {
    std::vector<const Class*> found;
    std::copy_if(inOrder.begin(), inOrder.end(), std::back_inserter(found),
                 [&](const Class* each) { return !cim::sameName(each->name, name) && isA(each->name, name); });
    return found;
}

const Class& Schema::add(Class declared) {
    if (findClass(declared.name) != nullptr) {
        throw std::invalid_argument("class " + declared.name + " is declared a second time");
    }
    checkUnique(declared);
    for (Property& property : declared.properties) {
        property.origin = declared.name;
    }
    for (Method& method : declared.methods) {
        method.origin = declared.name;
    }
    if (!declared.superclass.empty()) {
        const Class* super = findClass(declared.superclass);
        if (super == nullptr) {
            throw std::invalid_argument("superclass " + declared.superclass + " of class " + declared.name +
                                        " is not declared; declare or include it first");
        }
        declared.superclass = super->name;
        inheritQualifiers(declared.qualifiers, super->qualifiers);
        declared.properties = mergeProperties(declared, *super);
        declared.methods = mergeMethods(declared, *super);
    }
    const std::string name = declared.name;
    const auto added = byName.emplace(name, std::make_unique<const Class>(std::move(declared))).first;
    inOrder.push_back(added->second.get());
    return *added->second;
}

const QualifierDeclaration* Schema::findQualifier(std::string_view name) const {
    const auto found = qualifierDeclarations.find(name);
    return found == qualifierDeclarations.end() ? nullptr : &found->second;
}

std::vector<const QualifierDeclaration*> Schema::qualifiers() const {
    std::vector<const QualifierDeclaration*> found;
    for (const auto& [name, declaration] : qualifierDeclarations) {
        found.push_back(&declaration);
    }
    return found;
}

void Schema::add(QualifierDeclaration declaration) {
    const QualifierDeclaration* known = findQualifier(declaration.name);
    if (known != nullptr && !known->standard) {
        throw std::invalid_argument("qualifier " + declaration.name + " is declared a second time");
    }
    const std::string name = declaration.name;
    qualifierDeclarations.insert_or_assign(name, std::move(declaration));
}

}  // namespace cimhost
