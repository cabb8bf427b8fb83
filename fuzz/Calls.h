#pragma once

#include <optional>
#include <string>
#include <variant>

#include "Bytes.h"
#include "model/Request.h"
#include "model/Value.h"

// Calls of a provider, described by an input.

namespace fuzz {

/** Something other than a request that happens to a provider. */
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
    bool isValid = false;      ///< whether the class can be changed, the path has all keys, and the values match types

    bool performs(cimhost::Operation operation) const { return !event && request.operation == operation; }
    bool isRead() const { return !event && request.operation <= cimhost::Operation::getInstance; }
    bool isChange() const {
        return !event && request.operation >= cimhost::Operation::createInstance &&
               request.operation <= cimhost::Operation::deleteInstance;
    }
};

/** Describes a call for people. */
std::string describe(const Call& call);

/** The next call that the input describes. */
Call nextCall(Bytes& bytes);

/** A string: usually one with a meaning in some place, otherwise any bytes except 0. */
std::string nextString(Bytes& bytes);

}  // namespace fuzz
