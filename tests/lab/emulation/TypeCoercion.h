#pragma once

#include "broker/Broker.h"
#include "model/Request.h"
#include "model/Status.h"

// Checks of the properties that a client sends against the types of their class. Properties that the class does not
// have are ignored.

namespace cimhost::lab {

/** Fails if a string is sent for a number, which would crash the manager's provider process. */
Status refuseStringsForNumbers(Request& request, const Broker& broker);

/** Converts integers to the type of their property; refuses other types, and datetimes that do not exist. */
Status coerceToClass(Request& request, const Broker& broker);

}  // namespace cimhost::lab
