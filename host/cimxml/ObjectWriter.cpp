#include "cimxml/ObjectWriter.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <type_traits>

#include "cim/Names.h"
#include "cim/Utf8.h"
#include "cimxml/Errors.h"
#include "cimxml/XmlWriter.h"
#include "model/Value.h"

namespace cimhost::cimxml {
namespace {

template <class Number>
std::string digitsOf(Number number) {
    std::array<char, 64> digits{};
    return {digits.data(), std::to_chars(digits.data(), digits.data() + digits.size(), number).ptr};
}

struct Characters {
    std::string operator()(std::monostate) const { return {}; }
    std::string operator()(bool value) const { return value ? "TRUE" : "FALSE"; }
    std::string operator()(Char16 character) const {
        std::string string;
        cim::appendUtf8(string, cim::isCodePoint(character.code) ? character.code : 0xFFFD);
        return string;
    }
    std::string operator()(const std::string& string) const { return string; }
    std::string operator()(const DateTime& dateTime) const { return dateTime.value; }
    std::string operator()(const std::shared_ptr<const ObjectPath>&) const { return {}; }
    std::string operator()(const std::shared_ptr<const Instance>&) const { return {}; }
    template <class Number>
    std::string operator()(Number number) const {
        if constexpr (std::is_floating_point_v<Number>) {
            if (!std::isfinite(number)) {
                return std::isnan(number) ? "NaN" : number < 0 ? "-INF" : "INF";
            }
        }
        return digitsOf(number);
    }
};

const ObjectPath* referenceIn(const Scalar& scalar) {
    const auto* path = std::get_if<std::shared_ptr<const ObjectPath>>(&scalar);
    return path == nullptr ? nullptr : path->get();
}

const Instance* instanceIn(const Scalar& scalar) {
    const auto* instance = std::get_if<std::shared_ptr<const Instance>>(&scalar);
    return instance == nullptr ? nullptr : instance->get();
}

const char* valueTypeOf(CMPIType type) {
    return type == CMPI_boolean                                            ? "boolean"
           : isInteger(type) || type == CMPI_real32 || type == CMPI_real64 ? "numeric"
                                                                           : "string";
}

bool isWanted(const std::string& name, const InstanceParts& parts) {
    if (parts.onlyOf != nullptr && parts.onlyOf->findProperty(name) == nullptr) {
        return false;
    }
    return !parts.properties || std::any_of(parts.properties->begin(), parts.properties->end(),
                                            [&](const std::string& each) { return cim::sameName(each, name); });
}

/** The element of a property that is not a reference, and its type in CIM-XML. */
const char* elementOf(const Value& value) {
    return value.type == CMPI_ref ? "PROPERTY.REFERENCE" : value.isArray ? "PROPERTY.ARRAY" : "PROPERTY";
}

std::string_view xmlType(CMPIType type) {
    return type == CMPI_instance || type == CMPI_null ? std::string_view("string") : typeName(type);
}

std::string startTagOf(const NamedValue& property, const Property* declared) {
    std::string xml;
    appendStartTag(xml, elementOf(property.value), [&] {
        appendAttribute(xml, "NAME", property.name);
        if (declared != nullptr) {
            appendAttribute(xml, "CLASSORIGIN", declared->origin);
        }
        if (property.value.type != CMPI_ref) {
            appendAttribute(xml, "TYPE", xmlType(property.value.type));
        }
        if (property.value.type == CMPI_instance) {
            appendAttribute(xml, "EmbeddedObject", "instance");
        }
    });
    return xml;
}

bool isRepresentable(const Scalar& scalar) {
    if (const auto* string = std::get_if<std::string>(&scalar)) {
        return cimxml::isRepresentable(*string);
    }
    const bool isShort = std::holds_alternative<Char16>(scalar) || std::holds_alternative<DateTime>(scalar);
    return !isShort || cimxml::isRepresentable(charactersOf(scalar));
}

void requireRepresentable(const Value& value, const std::string& className, const std::string& name) {
    for (const Scalar& scalar : value.elements()) {
        if (!isRepresentable(scalar)) {
            throw CimError(CMPI_RC_ERR_FAILED,
                           "The value of " + className + "." + name + " has a character that XML cannot represent.");
        }
        if (const ObjectPath* path = referenceIn(scalar)) {
            cimxml::requireRepresentable(*path);
        }
        if (const Instance* instance = instanceIn(scalar)) {
            cimxml::requireRepresentable(*instance);
        }
    }
}

}  // namespace

std::string charactersOf(const Scalar& scalar) {
    return std::visit(Characters{}, scalar);
}

void requireRepresentable(const ObjectPath& path) {
    for (const NamedValue& key : path.keys) {
        requireRepresentable(key.value, path.className, key.name);
    }
}

void requireRepresentable(const Instance& instance, const InstanceParts& parts) {
    requireRepresentable(instance.path);
    for (const NamedValue& property : instance.properties) {
        if (isWanted(property.name, parts)) {
            requireRepresentable(property.value, instance.path.className, property.name);
        }
    }
}

void ObjectWriter::append(std::string& xml, const Instance& instance, ObjectForm form,
                          const InstanceParts& parts) const {
    if (form == ObjectForm::instance) {
        return appendInstance(xml, instance, parts);
    }
    if (form == ObjectForm::namedInstance) {
        const Element named(xml, "VALUE.NAMEDINSTANCE");
        appendInstanceName(xml, instance.path);
        return appendInstance(xml, instance, parts);
    }
    const Element object(xml, form == ObjectForm::objectWithPath ? "VALUE.OBJECTWITHPATH" : "VALUE.INSTANCEWITHPATH");
    appendInstancePath(xml, instance.path);
    appendInstance(xml, instance, parts);
}

void ObjectWriter::append(std::string& xml, const ObjectPath& path, ObjectForm form) const {
    if (form == ObjectForm::instanceName) {
        return appendInstanceName(xml, path);
    }
    if (form == ObjectForm::instancePath) {
        return appendInstancePath(xml, path);
    }
    const Element object(xml, "OBJECTPATH");
    appendInstancePath(xml, path);
}

void ObjectWriter::appendInstance(std::string& xml, const Instance& instance, const InstanceParts& parts) const {
    const Element element(xml, "INSTANCE", [&] { appendAttribute(xml, "CLASSNAME", instance.path.className); });
    const Class* known = parts.origins != nullptr ? parts.origins->findClass(instance.path.className) : nullptr;
    std::size_t position = 0;
    for (const NamedValue& property : instance.properties) {
        if (isWanted(property.name, parts)) {
            xml += startTag(property, known != nullptr ? known->findProperty(property.name) : nullptr, position++);
            appendValue(xml, property.value);
            appendEndTag(xml, elementOf(property.value));
        }
    }
}

const std::string& ObjectWriter::startTag(const NamedValue& property, const Property* declared,
                                          std::size_t position) const {
    if (position == startTags.size()) {
        startTags.emplace_back();
    }
    StartTag& tag = startTags[position];
    const Value& value = property.value;
    const bool isSame = tag.name == property.name && tag.type == value.type && tag.isArray == value.isArray &&
                        tag.declared == declared && !tag.xml.empty();
    if (!isSame) {
        tag = {property.name, value.type, value.isArray, declared, startTagOf(property, declared)};
    }
    return tag.xml;
}

void ObjectWriter::appendValue(std::string& xml, const Value& value) const {
    if (value.isNull) {
        return;
    }
    if (!value.isArray) {
        return appendScalar(xml, value.single);
    }
    const Element array(xml, value.type == CMPI_ref ? "VALUE.REFARRAY" : "VALUE.ARRAY");
    for (const Scalar& each : value.elements()) {
        if (std::holds_alternative<std::monostate>(each)) {
            const Element null(xml, "VALUE.NULL");
        } else {
            appendScalar(xml, each);
        }
    }
}

void ObjectWriter::appendScalar(std::string& xml, const Scalar& scalar) const {
    if (const ObjectPath* path = referenceIn(scalar)) {
        return appendReference(xml, *path);
    }
    const Element value(xml, "VALUE");
    if (const Instance* instance = instanceIn(scalar)) {
        std::string embedded;
        appendInstance(embedded, *instance);
        return appendEscaped(xml, embedded);
    }
    if (const auto* string = std::get_if<std::string>(&scalar)) {
        return appendEscaped(xml, *string);
    }
    appendEscaped(xml, charactersOf(scalar));
}

void ObjectWriter::appendReference(std::string& xml, const ObjectPath& path) const {
    const Element reference(xml, "VALUE.REFERENCE");
    if (!path.host.empty()) {
        return appendInstancePath(xml, path);
    }
    const Element local(xml, "LOCALINSTANCEPATH");
    appendLocalNameSpacePath(xml, path.nameSpace);
    appendInstanceName(xml, path);
}

void ObjectWriter::appendInstanceName(std::string& xml, const ObjectPath& path) const {
    const Element name(xml, "INSTANCENAME", [&] { appendAttribute(xml, "CLASSNAME", path.className); });
    for (const NamedValue& key : path.keys) {
        appendKey(xml, key);
    }
}

void ObjectWriter::appendKey(std::string& xml, const NamedValue& key) const {
    const Element binding(xml, "KEYBINDING", [&] { appendAttribute(xml, "NAME", key.name); });
    const Scalar& value = key.value.single;
    if (const ObjectPath* path = referenceIn(value)) {
        return appendReference(xml, *path);
    }
    const Element element(xml, "KEYVALUE", [&] {
        appendAttribute(xml, "VALUETYPE", valueTypeOf(key.value.type));
        appendAttribute(xml, "TYPE", xmlType(key.value.type));
    });
    appendEscaped(xml, charactersOf(value));
}

void ObjectWriter::appendInstancePath(std::string& xml, const ObjectPath& path) const {
    const Element element(xml, "INSTANCEPATH");
    appendNameSpacePath(xml, path);
    appendInstanceName(xml, path);
}

void ObjectWriter::appendClassPath(std::string& xml, const std::string& className) const {
    const Element element(xml, "CLASSPATH");
    appendNameSpacePath(xml, {});
    const Element name(xml, "CLASSNAME", [&] { appendAttribute(xml, "NAME", className); });
}

void ObjectWriter::appendNameSpacePath(std::string& xml, const ObjectPath& path) const {
    const Element place(xml, "NAMESPACEPATH");
    {
        const Element element(xml, "HOST");
        appendEscaped(xml, path.host.empty() ? host : path.host);
    }
    appendLocalNameSpacePath(xml, path.nameSpace);
}

void ObjectWriter::appendLocalNameSpacePath(std::string& xml, const std::string& itsNameSpace) const {
    const Element local(xml, "LOCALNAMESPACEPATH");
    std::string_view rest = itsNameSpace.empty() ? nameSpace : itsNameSpace;
    while (!rest.empty()) {
        const std::string_view part = rest.substr(0, rest.find('/'));
        const Element element(xml, "NAMESPACE", [&] { appendAttribute(xml, "NAME", part); });
        rest.remove_prefix(std::min(part.size() + 1, rest.size()));
    }
}

}  // namespace cimhost::cimxml
