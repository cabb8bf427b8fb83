#include "Target.h"

#include "schema/CimType.h"
#include "schema/Errors.h"
#include "schema/MofReader.h"
#include "schema/MofWriter.h"

#include <algorithm>
#include <cctype>
#include <string>
#include <string_view>

// MOF: a text is refused with a LoadError, or its classes hang together and its values read the same once written.

namespace {

using cimhost::Class;
using cimhost::Property;
using cimhost::Schema;
using cimhost::Value;
using fuzz::require;
using fuzz::requireSame;

bool containsIgnoringCase(std::string_view text, std::string_view word) {
    return std::search(text.begin(), text.end(), word.begin(), word.end(), [](char left, char right) {
               return std::tolower(static_cast<unsigned char>(left)) == right;
           }) != text.end();
}

/** Whether the text could include files of this machine, by a path that leads out of the folder that is looked in. */
bool mayReadFiles(std::string_view text) {
    return containsIgnoringCase(text, "pragma") && text.find_first_of("/\\") != std::string_view::npos;
}

std::string upperCase(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char each) { return static_cast<char>(std::toupper(each)); });
    return text;
}

void requireSound(const Schema& schema, const Class& each) {
    require(schema.findClass(upperCase(each.name)) == &each, "a class is found by its name in any letter case");
    const Class* super = schema.findClass(each.superclass);
    require(each.superclass.empty() == (super == nullptr), "a superclass is there");
    require(super == nullptr || each.properties.size() >= super->properties.size(), "properties are inherited");
    require(super == nullptr || schema.isA(each.name, super->name), "a class is one of its superclass");
    for (const Property& property : each.properties) {
        require(each.findProperty(upperCase(property.name)) == &property, "no property is there twice");
        require(schema.isA(each.name, property.origin), "a property is declared by the class or one above it");
        require(property.type != CMPI_ref || !property.referenceClass.empty(), "a reference has a class");
    }
}

bool isSettled(const Schema& schema, const cimhost::ObjectPath& path, const std::string& referenceClass);

/** Whether references in the value are read alike by now: they may be to classes that were declared only later. */
bool isSettled(const Schema& schema, const Value& value, const std::string& referenceClass) {
    return std::all_of(value.elements.begin(), value.elements.end(), [&](const cimhost::Scalar& element) {
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

/** The defaults of a class read the same once written. */
void requireSameDefaults(Schema& schema, const Class& each) {
    std::string declarations;
    for (const Property& property : each.properties) {
        if (isSettled(schema, property.defaultValue, property.referenceClass)) {
            declarations += declaration(property);
        }
    }
    const std::string name = newClassName(schema);
    cimhost::MofReader(schema).readSource("class " + name + " {\n" + declarations + "};\n", "rewritten");
    std::string again;
    for (const Property& property : schema.findClass(name)->properties) {
        again += declaration(property);
    }
    requireSame(again, declarations, "defaults that were written and read");
}

bool isSettled(const Schema& schema, const cimhost::Instance& instance) {
    const Class* declared = schema.findClass(instance.path.className);
    return std::all_of(instance.properties.begin(), instance.properties.end(), [&](const cimhost::NamedValue& each) {
        return isSettled(schema, each.value, declared->findProperty(each.name)->referenceClass);
    });
}

/** The instances read the same once written. */
void requireSameInstances(Schema& schema) {
    const std::vector<cimhost::Instance> instances = schema.instances();
    for (const cimhost::Instance& instance : instances) {
        if (isSettled(schema, instance)) {
            const std::string text = cimhost::formatMof(instance);
            cimhost::MofReader(schema).readSource(text, "rewritten");
            requireSame(cimhost::formatMof(schema.instances().back()), text, "instance that was written and read");
        }
    }
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = fuzz::textOf(data, size);
    if (mayReadFiles(text)) {
        return -1;
    }
    Schema schema;
    try {
        cimhost::MofReader(schema).readSource(text, "input", "/nonexistent");
    } catch (const cimhost::LoadError& error) {
        require(std::string(error.what()).rfind("input:", 0) == 0, "an error begins with where it is");
    }
    for (const Class* each : schema.classes()) {
        requireSound(schema, *each);
        requireSameDefaults(schema, *each);
    }
    requireSameInstances(schema);
    return 0;
}
