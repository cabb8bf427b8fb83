#include "Values.h"

#include "Calls.h"

#include <charconv>
#include <cstdint>
#include <limits>

namespace gate {

namespace {

std::optional<std::string> charactersOf(const char* characters) {
    return characters == nullptr ? std::nullopt : std::optional<std::string>(characters);
}

/** A datetime's characters; none for a null one, although the value is there. */
std::optional<std::string> charactersOf(const CMPIDateTime* dateTime) {
    return cim::charactersOf(ask<&CMPIDateTimeFT::getStringFormat>(dateTime).value);
}

/** The value's text, by its own type; none for a type that no class here has. */
std::optional<std::string> textOf(const CMPIData& data) {
    const CMPIValue& value = data.value;
    switch (data.type) {
        case CMPI_chars:
            return charactersOf(value.chars);
        case CMPI_string:
            return cim::charactersOf(value.string);
        case CMPI_dateTime:
            return charactersOf(value.dateTime);
        case CMPI_boolean:
            return value.boolean != 0 ? "true" : "false";
        case CMPI_uint8:
            return std::to_string(value.uint8);
        case CMPI_uint16:
            return std::to_string(value.uint16);
        case CMPI_uint32:
            return std::to_string(value.uint32);
        case CMPI_uint64:
            return std::to_string(value.uint64);
        case CMPI_sint8:
            return std::to_string(value.sint8);
        case CMPI_sint16:
            return std::to_string(value.sint16);
        case CMPI_sint32:
            return std::to_string(value.sint32);
        case CMPI_sint64:
            return std::to_string(value.sint64);
        default:
            return std::nullopt;
    }
}

bool isText(CMPIType type) {
    return type == CMPI_string || type == CMPI_chars;
}

bool isInteger(CMPIType type) {
    return (type & CMPI_INTEGER) != 0 && (type & (CMPI_ENC | CMPI_ARRAY)) == 0;
}

/** Whether a value of one type may stand for a property of another: managers do not keep types apart strictly. */
bool standsFor(CMPIType given, CMPIType wanted) {
    switch (wanted) {
        case CMPI_string:
            return isText(given);
        case CMPI_dateTime:
            return given == CMPI_dateTime || isText(given);
        case CMPI_boolean:
            return given == CMPI_boolean;
        default:
            return isInteger(given);
    }
}

std::optional<std::uint32_t> numberIn(const std::string& text) {
    std::uint32_t number = 0;
    const char* end = text.data() + text.size();
    const auto [last, error] = std::from_chars(text.data(), end, number);
    return error == std::errc() && last == end ? std::optional<std::uint32_t>(number) : std::nullopt;
}

/** Whether a number is not too large for its type; other values fit. */
bool fits(const std::string& text, CMPIType wanted) {
    if (wanted != CMPI_uint32 && wanted != CMPI_uint16) {
        return true;
    }
    const auto number = numberIn(text);
    return number && (wanted == CMPI_uint32 || *number <= std::numeric_limits<std::uint16_t>::max());
}

/** By the convention of CMPI, a value of type CMPI_chars is the characters themselves. */
const CMPIValue* asValue(const std::string& text) {
    return reinterpret_cast<const CMPIValue*>(text.c_str());
}

void add(const CMPIObjectPath* path, const char* name, const CMPIValue* value, CMPIType type) {
    // The table's function takes a path that may be changed, unlike the paths that are handed around.
    const CMPIStatus status = tell<&CMPIObjectPathFT::addKey>(const_cast<CMPIObjectPath*>(path), name, value, type);
    require(status.rc == CMPI_RC_OK, "add a key", status);
}

CMPIValue reference(const CMPIObjectPath* target) {
    CMPIValue value{};
    value.ref = const_cast<CMPIObjectPath*>(target);
    return value;
}

}  // namespace

std::optional<std::string> valueOf(const CMPIData& data, const CMPIStatus& status, const Property& property) {
    if (saysAbsent(status)) {
        return std::nullopt;
    }
    require(status.rc == CMPI_RC_OK, (std::string("give the value of ") + property.name).c_str(), status);
    if (!cim::hasValue(data)) {
        return std::nullopt;
    }
    if (!standsFor(data.type, property.type)) {
        fail(CMPI_RC_ERR_TYPE_MISMATCH,
             std::string(property.name) + ": the value is of another type than the property.");
    }
    auto text = textOf(data);
    if (text && !fits(*text, property.type)) {
        fail(CMPI_RC_ERR_TYPE_MISMATCH,
             std::string(property.name) + ": " + *text + " does not fit the property's type.");
    }
    return text;
}

std::optional<std::string> propertyOf(const CMPIInstance* instance, const Property& property) {
    const auto answer = ask<&CMPIInstanceFT::getProperty>(instance, property.name);
    return valueOf(answer.value, answer.status, property);
}

std::optional<std::string> keyOf(const CMPIObjectPath* path, const Property& property) {
    const auto answer = ask<&CMPIObjectPathFT::getKey>(path, property.name);
    const bool isUsable = answer.isOk() && cim::hasValue(answer.value) && standsFor(answer.value.type, property.type);
    return isUsable ? textOf(answer.value) : std::nullopt;
}

CMPIObjectPath* referenceOf(const CMPIObjectPath* path, const char* key) {
    const auto answer = ask<&CMPIObjectPathFT::getKey>(path, key);
    const bool isUsable = answer.isOk() && cim::hasValue(answer.value) && answer.value.type == CMPI_ref;
    return isUsable ? answer.value.value.ref : nullptr;
}

CMPIValue scalarFrom(const std::string& text, CMPIType type) {
    CMPIValue value{};
    if (type == CMPI_boolean) {
        value.boolean = text == "true" ? 1 : 0;
    } else if (type == CMPI_uint16) {
        value.uint16 = static_cast<CMPIUint16>(numberIn(text).value_or(0));
    } else {
        value.uint32 = numberIn(text).value_or(0);
    }
    return value;
}

void setReference(const CMPIInstance* instance, const char* name, const CMPIObjectPath* target) {
    const CMPIValue value = reference(target);
    const CMPIStatus status = tell<&CMPIInstanceFT::setProperty>(instance, name, &value, CMPIType{CMPI_ref});
    require(status.rc == CMPI_RC_OK, "set a property", status);
}

void addKey(const CMPIObjectPath* path, const char* name, const std::string& text) {
    add(path, name, asValue(text), CMPI_chars);
}

void addReference(const CMPIObjectPath* path, const char* name, const CMPIObjectPath* target) {
    const CMPIValue value = reference(target);
    add(path, name, &value, CMPI_ref);
}

}  // namespace gate
