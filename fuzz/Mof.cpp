#include <algorithm>
#include <cctype>
#include <string>
#include <string_view>
#include <vector>

#include "Target.h"
#include "model/Value.h"
#include "schema/Errors.h"
#include "schema/MofReader.h"
#include "schema/MofWriter.h"

// MOF: an error is a LoadError. The classes that are read are consistent, and their values and the instances are the
// same after they are written and read.

namespace {

using cimhost::Class;
using cimhost::Property;
using cimhost::Schema;
using cimhost::Value;
using fuzz::require;
using fuzz::requireSame;

bool containsIgnoringCase(std::string_view mof, std::string_view word) {
    return std::search(mof.begin(), mof.end(), word.begin(), word.end(), [](char left, char right) {
               return std::tolower(static_cast<unsigned char>(left)) == right;
           }) != mof.end();
}

/** Whether the MOF could include a file outside of the directory of includes. */
bool mayReadFiles(std::string_view mof) {
    return containsIgnoringCase(mof, "pragma") && mof.find_first_of("/\\") != std::string_view::npos;
}

std::string upperCase(std::string name) {
    std::transform(name.begin(), name.end(), name.begin(),
                   [](unsigned char each) { return static_cast<char>(std::toupper(each)); });
    return name;
}

void requireSound(const Schema& schema, const Class& each) {
    require(schema.findClass(upperCase(each.name)) == &each, "a class is found by its name in any letter case");
    const Class* super = schema.findClass(each.superclass);
    require(each.superclass.empty() == (super == nullptr), "the superclass exists");
    require(super == nullptr || each.properties.size() >= super->properties.size(), "properties are inherited");
    require(super == nullptr || schema.isA(each.name, super->name), "a class is derived from its superclass");
    for (const Property& property : each.properties) {
        require(each.findProperty(upperCase(property.name)) == &property, "property names are unique");
        require(schema.isA(each.name, property.origin), "a property is declared by the class or a superclass");
        require(property.type != CMPI_ref || !property.referenceClass.empty(), "a reference has a class");
    }
}

bool isSettled(const Schema& schema, const cimhost::ObjectPath& path, const std::string& referenceClass);

/** Whether references in a value are read in the same way again. They can differ if a class was declared after them. */
bool isSettled(const Schema& schema, const Value& value, const std::string& referenceClass) {
    return std::all_of(value.elements().begin(), value.elements().end(), [&](const cimhost::Scalar& element) {
        const auto* path = std::get_if<std::shared_ptr<const cimhost::ObjectPath>>(&element);
        return path == nullptr || isSettled(schema, **path, referenceClass);
    });
}

bool isSettled(const Schema& schema, const cimhost::ObjectPath& path, const std::string& referenceClass) {
    const Class* known = schema.findClass(path.className);
    if (known == nullptr) {
        return true;
    }
    const bool fits = schema.findClass(referenceClass) == nullptr || schema.isA(path.className, referenceClass);
    return fits && std::all_of(path.keys.begin(), path.keys.end(), [&](const cimhost::NamedValue& key) {
               const Property* property = known->findProperty(key.name);
               return property != nullptr && property->isKey() && property->type == key.value.type &&
                      isSettled(schema, key.value, property->referenceClass);
           });
}

std::string declaration(const Property& property) {
    const std::string type =
        property.type == CMPI_ref ? property.referenceClass + " REF" : std::string(cimhost::typeName(property.type));
    return "  " + type + " " + property.name + (property.isArray ? "[]" : "") + " = " +
           cimhost::formatMof(property.defaultValue) + ";\n";
}

std::string newClassName(const Schema& schema) {
    std::string name = "Rewritten";
    while (schema.findClass(name) != nullptr) {
        name += "_";
    }
    return name;
}

/** Requires that the defaults of a class are the same after they are written and read. */
void requireSameDefaults(Schema& schema, const Class& each) {
    std::string declarations;
    for (const Property& property : each.properties) {
        if (isSettled(schema, property.defaultValue, property.referenceClass)) {
            declarations += declaration(property);
        }
    }
    const std::string name = newClassName(schema);
    cimhost::MofReader(schema).readSource("class " + name + " {\n" + declarations + "};\n", "rewritten");
    std::string reread;
    for (const Property& property : schema.findClass(name)->properties) {
        reread += declaration(property);
    }
    requireSame(reread, declarations, "defaults that were written and read");
}

bool isSettled(const Schema& schema, const cimhost::Instance& instance) {
    const Class* declared = schema.findClass(instance.path.className);
    return std::all_of(instance.properties.begin(), instance.properties.end(), [&](const cimhost::NamedValue& each) {
        return isSettled(schema, each.value, declared->findProperty(each.name)->referenceClass);
    });
}

/** Requires that the instances are the same after they are written and read. */
void requireSameInstances(Schema& schema) {
    const std::vector<cimhost::Instance> instances = schema.instances();
    for (const cimhost::Instance& instance : instances) {
        if (isSettled(schema, instance)) {
            const std::string mof = cimhost::formatMof(instance);
            cimhost::MofReader(schema).readSource(mof, "rewritten");
            requireSame(cimhost::formatMof(schema.instances().back()), mof, "instance that was written and read");
        }
    }
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view mof = fuzz::inputOf(data, size);
    if (mayReadFiles(mof)) {
        return -1;
    }
    Schema schema;
    try {
        cimhost::MofReader(schema).readSource(mof, "input", "/nonexistent");
    } catch (const cimhost::LoadError& error) {
        require(std::string(error.what()).rfind("input:", 0) == 0, "an error begins with its position");
    }
    const std::vector<const Class*> classes = schema.classes();  // a copy: rewritten classes are added below
    for (const Class* each : classes) {
        requireSound(schema, *each);
        requireSameDefaults(schema, *each);
    }
    requireSameInstances(schema);
    return 0;
}
