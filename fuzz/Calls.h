#pragma once

#include <optional>
#include <string>
#include <variant>

#include "Bytes.h"
#include "model/Request.h"
#include "model/Value.h"

// Calls to a provider, derived from an input.

namespace fuzz {

/** A call or an event of a provider that is not a request. */
enum class Event {
    cleanup,  ///< of the instance interface
    associationCleanup,
    restart,  ///< the library is unloaded and loaded again
};

/** A request to a provider, or an event. */
struct Call {
    std::optional<Event> event{};  ///< none: the request
    cimhost::Request request{};
    bool hasInstance = false;  ///< false: the instance of a creation or modification is a null pointer
    bool isValid = false;      ///< whether the class can be changed, all keys are present, and all types are right

    bool performs(cimhost::Operation operation) const { return !event && request.operation == operation; }
    bool isRead() const { return !event && request.operation <= cimhost::Operation::getInstance; }
    bool isChange() const {
        return !event && request.operation >= cimhost::Operation::createInstance &&
               request.operation <= cimhost::Operation::deleteInstance;
    }
};

/** Returns a readable description of a call. */
std::string describe(const Call& call);

/** The next call that the input describes. */
Call nextCall(Bytes& bytes);

/** A string: in half of the cases one that has a meaning for a provider, otherwise up to 15 bytes other than 0. */
std::string nextString(Bytes& bytes);

}  // namespace fuzz
