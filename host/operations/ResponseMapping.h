#pragma once

#include <vector>

#include "operations/ManagerBehaviour.h"

namespace cimhost {

/**
 * Maps the responses of the providers that performed a request to the response that the client receives: the results of
 * all providers, in order, or the first failure. A provider that does not support the operation is ignored if another
 * one succeeds. The status is CMPI_RC_ERR_FAILED if a provider returned results of the wrong kind, and
 * CMPI_RC_ERR_NOT_FOUND if getInstance succeeded without an instance.
 * @param keepsEvents whether the responses of the providers also keep the results
 */
Response mapResponses(const ManagerBehaviour& behaviour, const Request& request,
                      std::vector<ProviderResponse> responses, bool keepsEvents);

}  // namespace cimhost
