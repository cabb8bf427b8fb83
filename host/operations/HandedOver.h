#pragma once

#include "broker/Broker.h"
#include "operations/Request.h"

namespace cimhost {

/**
 * The request as the broker's object manager hands it to a provider: texts trimmed, instances completed, keys that
 * cannot be read, property lists where the client sent none... Profile tells which of these. Without the class's shape
 * nothing is known of its properties, and none are added. The standard manager hands requests over as they are.
 */
Request handedOver(Request request, const Broker& broker);

}  // namespace cimhost
