#pragma once

#include <functional>

#include "broker/Broker.h"
#include "model/Request.h"

// Changes that object managers make to a request before the provider receives it.

namespace cimhost::lab {

/** The keys in the path of a new instance. */
enum class CreationKey {
    asSent,
    unreadable,  ///< keys are counted, but have no value
    empty        ///< keys are empty strings
};

/** Removes characters from both ends of strings in keys and properties. */
void trimStrings(Request& request, const std::function<bool(char)>& isRemoved);

/**
 * Adds to the instance of a creation or modification all properties of its class that the client did not set, in the
 * order of the class, and to the path of a creation its keys. An unknown class adds nothing.
 * @param unsetString the value of single strings that are not set; others are null
 */
void completeInstance(Request& request, const Broker& broker, const Value& unsetString, CreationKey creationKey);

/** Lists all properties if the client sent no list. Otherwise, adds the keys to the list of a modification. */
void completePropertyList(Request& request, const Broker& broker);

}  // namespace cimhost::lab
