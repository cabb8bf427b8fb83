#pragma once

#include "Failure.h"

#include <cmpift.h>

#include <string>

// Calls of the object manager. Brokers leave functions out and answer null: nothing here trusts them.

namespace gate {

/** A string's characters; empty when any part of it is missing. */
std::string textOf(const CMPIString* string);

/** What a function answered, and with which status. A function that is not there answers nothing, and an error. */
template <class Value>
struct Answer {
    Value value;
    CMPIStatus status;

    bool isOk() const { return status.rc == CMPI_RC_OK; }
};

/** Calls a function that takes a status at its end, from the table of the object it is about. */
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

/** Calls a function that answers a status. */
template <auto function, class Object, class... Arguments>
CMPIStatus tell(Object* object, Arguments... arguments) {
    if (object == nullptr || object->ft == nullptr || object->ft->*function == nullptr) {
        return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
    }
    return (object->ft->*function)(object, arguments...);
}

/** Calls one of the broker's functions that make objects; null when it does not make one. */
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

/** Whether a status says that a key or property is not there, which is no failure to give it. */
bool saysAbsent(const CMPIStatus& status);

/** Fails with what the object manager could not do, unless it could. */
void require(bool couldBeDone, const char* what, const CMPIStatus& status = {CMPI_RC_OK, nullptr});

}  // namespace gate
