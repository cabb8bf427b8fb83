#pragma once

#include "broker/Broker.h"
#include "model/Status.h"
#include "operations/Request.h"

namespace cimhost {

/**
 * Looks at the types of the properties that a client sends, as the broker's object manager does before it asks the
 * provider, and may convert them. Properties that the class does not have are left alone.
 * @return OK, or why the provider is not asked
 */
Status takeTypes(Request& request, const Broker& broker);

}  // namespace cimhost
