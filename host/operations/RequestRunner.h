#pragma once

#include <cmpift.h>

#include "broker/Broker.h"
#include "broker/RequestScope.h"
#include "operations/ProviderCall.h"
#include "operations/Request.h"

namespace cimhost {

/**
 * Runs one request against one management interface, on the calling thread, and tells all that came of it. What the
 * provider makes through the broker ends with the request. A function that the provider lacks answers
 * CMPI_RC_ERR_NOT_SUPPORTED. Requests may come out of requests.
 * @param request an operation of that interface's kind; std::invalid_argument for one of the other kind
 */
RawAnswer runRequest(Broker& broker, CMPIInstanceMI* interface, const Request& request);
RawAnswer runRequest(Broker& broker, CMPIAssociationMI* interface, const Request& request);

/**
 * Runs any call of a provider as a request of its own.
 * @param call called with a RequestScope&, const CMPIContext* and const CMPIResult*; answers a CMPIStatus
 */
template <class Call>
RawAnswer runCall(Broker& broker, const ContextEntries& entries, Call&& call) {
    RawAnswer answer;
    RequestScope scope(broker);
    const CMPIContext* context = scope.context(entries);
    const CMPIResult* result = scope.result(answer.events);
    ProviderCall outcome = callProvider([&] { return call(scope, context, result); });
    answer.status = std::move(outcome.status);
    answer.hasMessage = outcome.hasMessage;
    answer.threw = outcome.threw;
    return answer;
}

}  // namespace cimhost
