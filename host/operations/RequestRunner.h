#pragma once

#include <cmpift.h>

#include "broker/Broker.h"
#include "broker/RequestScope.h"
#include "operations/ProviderCall.h"
#include "operations/Request.h"

namespace cimhost {

/**
 * Runs one request against one management interface, as the broker's object manager would, and tells all that came of
 * it. What the provider makes through the broker ends with the request. A function that the provider lacks answers
 * CMPI_RC_ERR_NOT_SUPPORTED. Requests may come out of requests.
 * @param request an operation of that interface's kind; std::invalid_argument for one of the other kind
 */
RawAnswer runRequest(Broker& broker, CMPIInstanceMI* interface, const Request& request);
RawAnswer runRequest(Broker& broker, CMPIAssociationMI* interface, const Request& request);

/**
 * Runs any call of a provider as a request of its own, on the calling thread.
 * @param call called with a RequestScope&, const CMPIContext* and const CMPIResult*; answers a CMPIStatus
 */
template <class Call>
RawAnswer runCall(Broker& broker, const ContextEntries& entries, Call&& call, const ResultRules& rules = {}) {
    RawAnswer answer;
    RequestScope scope(broker);
    const CMPIContext* context = scope.context(entries);
    const CMPIResult* result = scope.result(answer.events, rules);
    ProviderCall outcome = callProvider([&] { return call(scope, context, result); });
    answer.status = std::move(outcome.status);
    answer.hasMessage = outcome.hasMessage;
    answer.threw = outcome.threw;
    answer.releasedPath = RequestScope::isPathReleased(result);
    answer.manager = broker.profile().manager;
    return answer;
}

}  // namespace cimhost
