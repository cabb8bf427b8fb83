#pragma once

#include <cmpift.h>

#include "broker/Broker.h"
#include "broker/RequestScope.h"
#include "operations/Interfaces.h"
#include "operations/ManagerBehaviour.h"

namespace cimhost {

/**
 * Runs one request against one management interface and returns all that the provider did. Objects that the provider
 * creates through the broker are released at the end of the request. A function that the provider lacks results in
 * CMPI_RC_ERR_NOT_SUPPORTED. Requests may be nested.
 * @param request an operation of that interface's kind; std::invalid_argument for one of the other kind
 */
ProviderResponse runRequest(Broker& broker, CMPIInstanceMI* interface, Request request,
                            const ManagerBehaviour& behaviour = ManagerBehaviour::standard());
ProviderResponse runRequest(Broker& broker, CMPIAssociationMI* interface, Request request,
                            const ManagerBehaviour& behaviour = ManagerBehaviour::standard());

/**
 * Runs any call of a provider as a separate request, on the calling thread.
 * @param call called with a RequestScope&, const CMPIContext* and const CMPIResult*; returns a CMPIStatus
 */
template <class Call>
ProviderResponse runCall(Broker& broker, const ContextEntries& entries, Call&& call, const ResultRules& rules = {}) {
    ProviderResponse response;
    RequestScope scope(broker);
    const CMPIContext* context = scope.context(entries);
    const CMPIResult* result = scope.result(response.events, rules);
    ProviderCall outcome = callProvider([&] { return call(scope, context, result); });
    response.status = std::move(outcome.status);
    response.hasMessage = outcome.hasMessage;
    response.threw = outcome.threw;
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
