#pragma once

#include "Bytes.h"

#include "model/Request.h"
#include "model/Value.h"

#include <optional>
#include <string>

// Requests as an input describes them.

namespace fuzz {

/** An operation, with the number that cimhost::Operation gives it, or something else that is done to a provider. */
enum class Action {
    enumerateInstances,
    enumerateInstanceNames,
    getInstance,
    createInstance,
    modifyInstance,
    deleteInstance,
    execQuery,
    associators,
    associatorNames,
    references,
    referenceNames,
    cleanup,
    associationCleanup,
    restart,  ///< the library is unloaded and loaded again
};

/** A call with its arguments, of which it uses those that its action has; a null pointer where there is none. */
struct Call {
    Action action;
    cimhost::ObjectPath path{};
    cimhost::PropertyList properties{};
    std::optional<cimhost::Instance> instance{};
    cimhost::AssociationFilter filter{};
    bool isApt = false;  ///< can well succeed: has a class that keeps something, all of its keys, and values that fit
};

/** The call as people read it. */
std::string toText(const Call& call);

/** The next call that the input describes. */
Call nextCall(Bytes& bytes);

/** A text: mostly one that means something somewhere, else any bytes but 0. */
std::string nextText(Bytes& bytes);

}  // namespace fuzz
