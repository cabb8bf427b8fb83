#pragma once

#include <cmpift.h>

#include <optional>
#include <string>

// Safe calls to CMPI objects of an object manager. Managers leave functions out of their tables and return null
// pointers, so these functions check for both.

namespace cim {

/** The result and the status of a call; a zero value and CMPI_RC_ERR_NOT_SUPPORTED if the function is missing. */
template <class Value>
struct Answer {
    Value value;
    CMPIStatus status;

    bool isOk() const { return status.rc == CMPI_RC_OK; }
};

/** Calls a function of an object's table whose last parameter is a status. */
template <auto function, class Object, class... Arguments>
auto ask(Object* object, Arguments... arguments) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    using Value = decltype((object->ft->*function)(object, arguments..., &status));
    if (object == nullptr || object->ft == nullptr || object->ft->*function == nullptr) {
        return Answer<Value>{Value{}, {CMPI_RC_ERR_NOT_SUPPORTED, nullptr}};
    }
    const Value value = (object->ft->*function)(object, arguments..., &status);
    return Answer<Value>{value, status};
}

/** Calls a function of an object's table that returns its status. */
template <auto function, class Object, class... Arguments>
CMPIStatus tell(Object* object, Arguments... arguments) {
    if (object == nullptr || object->ft == nullptr || object->ft->*function == nullptr) {
        return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
    }
    return (object->ft->*function)(object, arguments...);
}

/** Calls one of the broker's functions that create objects. Returns null if it is missing or its status is an error. */
template <auto function, class... Arguments>
auto make(const CMPIBroker* broker, Arguments... arguments) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    using Object = decltype((broker->eft->*function)(broker, arguments..., &status));
    if (broker == nullptr || broker->eft == nullptr || broker->eft->*function == nullptr) {
        return Object{};
    }
    const Object object = (broker->eft->*function)(broker, arguments..., &status);
    return status.rc == CMPI_RC_OK ? object : Object{};
}

/** Returns the characters of a string, or none if the string, its table or its characters are missing. */
inline std::optional<std::string> charactersOf(const CMPIString* string) {
    const char* characters = ask<&CMPIStringFT::getCharPtr>(string).value;
    return characters != nullptr ? std::optional<std::string>(characters) : std::nullopt;
}

// Object managers set CMPIData::state differently, so read the data of each function as follows:
//
//   getKey, getKeyAt, getProperty, getPropertyAt
//       OpenPegasus and SFCB set the state: CMPI_nullValue for a value that is not set, CMPI_notFound (with an error
//       status) for a name that does not exist, CMPI_keyValue for a key. For a null string, SFCB returns a pointer to a
//       string object without characters; for a missing property, only the state CMPI_notFound. Check in this order:
//       status, state, type, pointer, characters. See hasValue().
//   getNext
//       OpenPegasus returns every element with the state CMPI_nullValue, SFCB with CMPI_goodValue. Check the status,
//       the type and the pointer, but never the state. See elementInstance().
//   Context entries
//       The provider, the gate and the agent do not read them.

/** Returns whether the data of a key or property has a value. CMPI_keyValue is not an error. */
inline bool hasValue(const CMPIData& data) {
    constexpr unsigned int flaws = CMPI_nullValue | CMPI_notFound | CMPI_badValue;
    return (data.state & flaws) == 0 && data.type != CMPI_null;
}

/** Returns the decimal digits of an integer of any type; none for another type. Ignores the state. */
inline std::optional<std::string> digitsOf(const CMPIData& data) {
    switch (data.type) {
        case CMPI_uint8:
            return std::to_string(data.value.uint8);
        case CMPI_uint16:
            return std::to_string(data.value.uint16);
        case CMPI_uint32:
            return std::to_string(data.value.uint32);
        case CMPI_uint64:
            return std::to_string(data.value.uint64);
        case CMPI_sint8:
            return std::to_string(data.value.sint8);
        case CMPI_sint16:
            return std::to_string(data.value.sint16);
        case CMPI_sint32:
            return std::to_string(data.value.sint32);
        case CMPI_sint64:
            return std::to_string(data.value.sint64);
        default:
            return std::nullopt;
    }
}

/**
 * Returns the characters of a string or datetime, the digits of an integer, "true" or "false" for a boolean; none for
 * another type or a null pointer. Ignores the state.
 */
inline std::optional<std::string> charactersOf(const CMPIData& data) {
    switch (data.type) {
        case CMPI_chars:
            return data.value.chars == nullptr ? std::nullopt : std::optional<std::string>(data.value.chars);
        case CMPI_string:
            return charactersOf(data.value.string);
        case CMPI_dateTime:
            return charactersOf(ask<&CMPIDateTimeFT::getStringFormat>(data.value.dateTime).value);
        case CMPI_boolean:
            return data.value.boolean != 0 ? "true" : "false";
        default:
            return digitsOf(data);
    }
}

/** Returns the instance of an enumeration element, regardless of its state; null if the element is not an instance. */
inline CMPIInstance* elementInstance(const CMPIData& element) {
    return element.type == CMPI_instance ? element.value.inst : nullptr;
}

}  // namespace cim
