#include "cimxml/ElementReader.h"

#include <algorithm>
#include <charconv>
#include <optional>
#include <string_view>

#include "cim/Names.h"
#include "cimxml/Errors.h"
#include "cimxml/Message.h"
#include "model/Value.h"
#include "schema/Errors.h"
#include "schema/Literal.h"
#include "schema/StringLiteral.h"

namespace cimhost::cimxml {
namespace {

[[noreturn]] void invalid(const std::string& why) {
    throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, why);
}

const std::string& attributeOf(const XmlElement& element, std::string_view name) {
    const std::string* value = element.attribute(name);
    if (value == nullptr) {
        invalid("Element " + element.name + " has no attribute " + std::string(name) + ".");
    }
    return *value;
}

const XmlElement& childOf(const XmlElement& element, std::string_view name) {
    const XmlElement* child = element.child(name);
    if (child == nullptr) {
        invalid("Element " + element.name + " has no " + std::string(name) + ".");
    }
    return *child;
}

std::string_view trimmed(std::string_view characters) {
    constexpr auto blanks = " \t\r\n";
    const std::size_t first = characters.find_first_not_of(blanks);
    return first == std::string_view::npos ? std::string_view{}
                                           : characters.substr(first, characters.find_last_not_of(blanks) + 1 - first);
}

/** Parses a decimal integer, or a hexadecimal one with 0x. Returns none for other strings. */
std::optional<IntegerLiteral> integerFrom(std::string_view digits) {
    IntegerLiteral integer;
    if (!digits.empty() && (digits.front() == '-' || digits.front() == '+')) {
        integer.negative = digits.front() == '-';
        digits.remove_prefix(1);
    }
    const bool isHexadecimal = digits.size() > 2 && digits[0] == '0' && (digits[1] == 'x' || digits[1] == 'X');
    digits.remove_prefix(isHexadecimal ? 2 : 0);
    const char* const end = digits.data() + digits.size();
    const auto result = std::from_chars(digits.data(), end, integer.magnitude, isHexadecimal ? 16 : 10);
    integer.tooLarge = result.ec == std::errc::result_out_of_range;
    if (result.ptr != end || result.ec == std::errc::invalid_argument) {
        return std::nullopt;
    }
    return integer;
}

Literal numberFrom(const std::string& characters) {
    const std::string_view digits = trimmed(characters);
    if (const std::optional<IntegerLiteral> integer = integerFrom(digits)) {
        return {*integer, characters};
    }
    double real = 0;
    const char* const end = digits.data() + digits.size();
    const auto result = std::from_chars(digits.data(), end, real);
    if (!digits.empty() && result.ptr == end && result.ec == std::errc{}) {
        return {real, characters};
    }
    return {characters, characters};
}

Literal booleanFrom(const std::string& characters) {
    const std::string_view word = trimmed(characters);
    if (cim::sameName(word, "true") || cim::sameName(word, "false")) {
        return {cim::sameName(word, "true"), characters};
    }
    return {characters, characters};
}

Literal literalFrom(const std::string& characters, CMPIType type) {
    switch (type) {
        case CMPI_string:
        case CMPI_dateTime:
            return {characters, characters};
        case CMPI_char16:
            if (const std::optional<std::uint16_t> code = singleCharacter(characters)) {
                return {Char16{*code}, characters};
            }
            return {characters, characters};
        case CMPI_boolean:
            return booleanFrom(characters);
        default:
            return numberFrom(characters);
    }
}

/** The type that an element names; string if it names none. */
CMPIType typeOfElement(const XmlElement& element) {
    const std::string* name = element.attribute("TYPE");
    if (name == nullptr) {
        return CMPI_string;
    }
    const std::optional<CMPIType> type = intrinsicType(*name);
    if (!type) {
        invalid("There is no type " + *name + ".");
    }
    return *type;
}

/** The type of a key value of an unknown class: TYPE, or else a type derived from VALUETYPE and the characters. */
CMPIType typeOfKey(const XmlElement& element) {
    if (element.attribute("TYPE") != nullptr) {
        return typeOfElement(element);
    }
    const std::string* kind = element.attribute("VALUETYPE");
    if (kind != nullptr && cim::sameName(*kind, "boolean")) {
        return CMPI_boolean;
    }
    return kind != nullptr && cim::sameName(*kind, "numeric") ? literalType(numberFrom(element.characters))
                                                              : CMPIType{CMPI_string};
}

const Property* findKey(const Class* known, const std::string& name) {
    if (known == nullptr) {
        return nullptr;
    }
    const Property* property = known->findProperty(name);
    if (property == nullptr || !property->isKey()) {
        invalid("Class " + known->name + " has no key " + name + ".");
    }
    return property;
}

}  // namespace

void requireFew(const XmlElement& element) {
    constexpr std::size_t most = 1'000;
    if (element.children.size() > most) {
        invalid("Element " + element.name + " has more than " + std::to_string(most) + " elements.");
    }
}

Scalar scalarFrom(const std::string& characters, CMPIType type) {
    return typedScalar(literalFrom(characters, type), type);
}

ObjectPath ElementReader::path(const XmlElement& element) const {
    if (element.name == "CLASSNAME" || element.name == "INSTANCENAME") {
        return instanceName(element, nameSpace);
    }
    if (element.name == "VALUE.REFERENCE" || element.name == "OBJECTPATH") {
        if (element.children.empty()) {
            invalid("Element " + element.name + " is empty.");
        }
        return path(element.children.front());
    }
    const bool isLocal = element.name == "LOCALINSTANCEPATH" || element.name == "LOCALCLASSPATH";
    if (!isLocal && element.name != "INSTANCEPATH" && element.name != "CLASSPATH") {
        invalid("Element " + element.name + " is not an object path.");
    }
    const XmlElement& place = isLocal ? element : childOf(element, "NAMESPACEPATH");
    const XmlElement* name = element.child("INSTANCENAME");
    return instanceName(name != nullptr ? *name : childOf(element, "CLASSNAME"),
                        nameSpaceOf(childOf(place, "LOCALNAMESPACEPATH")));
}

ObjectPath ElementReader::instanceName(const XmlElement& element, const std::string& itsNameSpace) const {
    requireFew(element);
    ObjectPath path;
    path.nameSpace = itsNameSpace;
    path.className = attributeOf(element, element.name == "CLASSNAME" ? "NAME" : "CLASSNAME");
    const Class* known = schema.findClass(path.className);
    path.className = known != nullptr ? known->name : path.className;
    for (const XmlElement& each : element.children) {
        if (each.name == "KEYBINDING") {
            if (each.children.empty()) {
                invalid("A KEYBINDING is empty.");
            }
            addKey(path, attributeOf(each, "NAME"), each.children.front());
        } else if (known != nullptr && known->keys().size() == 1) {  // The name of a single key may be omitted.
            addKey(path, known->keys().front()->name, each);
        } else {
            invalid("Element " + each.name + " needs a KEYBINDING.");
        }
    }
    return path;
}

void ElementReader::addKey(ObjectPath& path, const std::string& name, const XmlElement& element) const {
    const Property* key = findKey(schema.findClass(path.className), name);
    const auto same = [&](const NamedValue& each) { return cim::sameName(each.name, name); };
    if (std::any_of(path.keys.begin(), path.keys.end(), same)) {
        invalid("Key " + name + " is there twice.");
    }
    const bool isReference = element.name == "VALUE.REFERENCE";
    const CMPIType type = key != nullptr ? key->type : isReference ? CMPIType{CMPI_ref} : typeOfKey(element);
    path.keys.emplace_back(key != nullptr ? key->name : name, value(element, type, false));
}

Instance ElementReader::instance(const XmlElement& element) const {
    if (element.name != "INSTANCE") {
        invalid("Element " + element.name + " is not an INSTANCE.");
    }
    requireFew(element);
    Instance instance;
    instance.path.nameSpace = nameSpace;
    instance.path.className = attributeOf(element, "CLASSNAME");
    const Class* known = schema.findClass(instance.path.className);
    instance.path.className = known != nullptr ? known->name : instance.path.className;
    for (const XmlElement& each : element.children) {
        if (each.name == "QUALIFIER") {
            continue;
        }
        NamedValue property = this->property(each, known);
        const auto same = [&](const NamedValue& other) { return cim::sameName(other.name, property.name); };
        if (std::any_of(instance.properties.begin(), instance.properties.end(), same)) {
            invalid("Property " + property.name.string() + " is there twice.");
        }
        const Property* declared = known != nullptr ? known->findProperty(property.name) : nullptr;
        if (declared != nullptr && declared->isKey() && !property.value.isNull) {
            instance.path.keys.push_back(property);
        }
        instance.properties.push_back(std::move(property));
    }
    return instance;
}

Instance ElementReader::namedInstance(const XmlElement& element) const {
    Instance named = instance(childOf(element, "INSTANCE"));
    ObjectPath name = path(childOf(element, "INSTANCENAME"));
    if (!cim::sameName(named.path.className, name.className)) {
        invalid("The instance is of class " + named.path.className + ", but its name of class " + name.className + ".");
    }
    named.path = std::move(name);
    return named;
}

NamedValue ElementReader::property(const XmlElement& element, const Class* known) const {
    const bool isReference = element.name == "PROPERTY.REFERENCE";
    const bool isArray = element.name == "PROPERTY.ARRAY";
    if (!isReference && !isArray && element.name != "PROPERTY") {
        invalid("Element " + element.name + " is not a property.");
    }
    const std::string& name = attributeOf(element, "NAME");
    const Property* declared = known != nullptr ? known->findProperty(name) : nullptr;
    const CMPIType sent = isReference ? CMPIType{CMPI_ref} : typeOfElement(element);
    const CMPIType type = declared != nullptr ? declared->type : sent;
    if (declared != nullptr && (declared->isArray != isArray || (type == CMPI_ref) != isReference)) {
        throw CimError(CMPI_RC_ERR_TYPE_MISMATCH, "Element " + element.name + " does not fit the type of property " +
                                                      known->name + "." + declared->name + ".");
    }
    const auto isValue = [](const XmlElement& each) { return each.name.rfind("VALUE", 0) == 0; };
    if (std::count_if(element.children.begin(), element.children.end(), isValue) > 1) {
        invalid("Property " + name + " has several values.");
    }
    const auto sentValue = std::find_if(element.children.begin(), element.children.end(), isValue);
    try {
        return {declared != nullptr ? declared->name : name,
                sentValue == element.children.end() ? Value::null(type, isArray) : value(*sentValue, type, isArray)};
    } catch (const CimError& error) {
        throw CimError(error.code, "Property " + name + ": " + error.what());
    }
}

Value ElementReader::value(const XmlElement& element, CMPIType type, bool isArray) const {
    if (!isArray) {
        return Value::of(type, scalar(element, type));
    }
    if (element.name != "VALUE.ARRAY" && element.name != "VALUE.REFARRAY") {
        invalid("Element " + element.name + " is not an array.");
    }
    std::vector<Scalar> elements;
    for (const XmlElement& each : element.children) {
        elements.push_back(each.name == "VALUE.NULL" ? Scalar{} : scalar(each, type));
    }
    return Value::array(type, std::move(elements));
}

Scalar ElementReader::scalar(const XmlElement& element, CMPIType type) const {
    if (type == CMPI_ref) {
        if (element.name != "VALUE.REFERENCE") {
            invalid("Element " + element.name + " is not a reference.");
        }
        return std::make_shared<const ObjectPath>(path(element));
    }
    if ((element.name != "VALUE" && element.name != "KEYVALUE") || !element.children.empty()) {
        invalid("Element " + element.name + " is not a single value.");
    }
    try {
        return scalarFrom(element.characters, type);
    } catch (const ValueError& error) {
        invalid(error.what());
    }
}

}  // namespace cimhost::cimxml
