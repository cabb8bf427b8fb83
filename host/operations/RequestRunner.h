#pragma once

#include <cmpift.h>

#include "broker/Broker.h"
#include "broker/RequestScope.h"
#include "operations/Interfaces.h"
#include "operations/ManagerBehaviour.h"

namespace cimhost {

/**
 * Sends one request to a management interface. Objects that the provider creates through the broker, except clones, are
 * freed at the end of the request. The status is CMPI_RC_ERR_NOT_SUPPORTED if the provider lacks the function. Requests
 * can be nested.
 * @throws std::invalid_argument if this kind of interface does not have the operation
 */
ProviderResponse runRequest(Broker& broker, CMPIInstanceMI* interface, Request request,
                            const ManagerBehaviour& behaviour = ManagerBehaviour::standard());
ProviderResponse runRequest(Broker& broker, CMPIAssociationMI* interface, Request request,
                            const ManagerBehaviour& behaviour = ManagerBehaviour::standard());

/**
 * Calls a provider on the calling thread, in a separate RequestScope.
 * @param call called with a RequestScope&, const CMPIContext* and const CMPIResult*; returns a CMPIStatus
 */
template <class Call>
ProviderResponse runCall(Broker& broker, const ContextEntries& entries, Call&& call, const ResultRules& rules = {}) {
    ProviderResponse response;
    RequestScope scope(broker);
    const CMPIContext* context = scope.context(entries);
    const CMPIResult* result = scope.result(response.events, rules);
    ProviderCall finished = callProvider([&] { return call(scope, context, result); });
    response.status = std::move(finished.status);
    response.hasMessage = finished.hasMessage;
    response.threw = finished.threw;
    response.releasedPath = RequestScope::isPathReleased(result);
    return response;
}

/**
 * Calls the function of the table that performs the operation of the request.
 * @param instance the instance of a creation or modification; null for other operations
 */
CMPIStatus callOperation(CMPIInstanceMI* interface, const Request& request, const CMPIContext* context,
                         const CMPIResult* result, const CMPIObjectPath* path, const CMPIInstance* instance);
CMPIStatus callOperation(CMPIAssociationMI* interface, const Request& request, const CMPIContext* context,
                         const CMPIResult* result, const CMPIObjectPath* path);

}  // namespace cimhost
