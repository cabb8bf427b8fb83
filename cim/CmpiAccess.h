#pragma once

#include <cmpift.h>

#include <optional>
#include <string>

// Calls of CMPI objects that belong to an object manager. Managers leave functions out of their tables and return null
// pointers, so nothing here relies on either.

namespace cim {

/** The result and the status of a function call. A missing function returns a zero value and CMPI_RC_ERR_NOT_SUPPORTED.
 */
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

/** Calls a function of an object's table that returns a status. */
template <auto function, class Object, class... Arguments>
CMPIStatus tell(Object* object, Arguments... arguments) {
    if (object == nullptr || object->ft == nullptr || object->ft->*function == nullptr) {
        return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
    }
    return (object->ft->*function)(object, arguments...);
}

/** Calls one of the broker's functions that create objects. Null when the status is an error. */
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

/** The characters of a string; none if any part of it is missing. */
inline std::optional<std::string> charactersOf(const CMPIString* string) {
    const char* characters = ask<&CMPIStringFT::getCharPtr>(string).value;
    return characters != nullptr ? std::optional<std::string>(characters) : std::nullopt;
}

// What the object managers put into the state of a CMPIData decides how each place is read:
//
//   getKey, getKeyAt, getProperty, getPropertyAt
//       Both managers set the state: CMPI_nullValue for a value that is not set, CMPI_notFound (with an error status)
//       for a name that does not exist, CMPI_keyValue for a key. SFCB gives a null string a pointer to a string object
//       without characters, and a missing property the state CMPI_notFound alone. So: the status, then the state, then
//       the type, then the pointer, then the characters. See hasValue().
//   getNext
//       OpenPegasus returns every element with the state CMPI_nullValue; SFCB with CMPI_goodValue. So: the status, then
//       the type, then the pointer, and never the state. See elementInstance().
//   Context entries
//       are not read by the provider, the gate or the agent.

/** Whether the data of a key or a property holds a value. That it is the value of a key is no flaw. */
inline bool hasValue(const CMPIData& data) {
    constexpr unsigned int flaws = CMPI_nullValue | CMPI_notFound | CMPI_badValue;
    return (data.state & flaws) == 0 && data.type != CMPI_null;
}

/** The instance that an enumeration returned, whatever its state; null if the element is not an instance. */
inline CMPIInstance* elementInstance(const CMPIData& element) {
    return element.type == CMPI_instance ? element.value.inst : nullptr;
}

}  // namespace cim
