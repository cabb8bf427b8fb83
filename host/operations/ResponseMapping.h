#pragma once

#include <vector>

#include "operations/ManagerBehaviour.h"

namespace cimhost {

/**
 * Maps the responses of the providers that performed a request to what its client receives: the results of all
 * providers, in order, or the first failure. A provider that does not support the operation is ignored if another one
 * succeeds. Besides what providers return:
 * CMPI_RC_ERR_FAILED when a provider that succeeds returns other results than the operation has;
 * CMPI_RC_ERR_NOT_FOUND when getInstance succeeds without an instance.
 */
Response mapResponses(const ManagerBehaviour& behaviour, const Request& request,
                      std::vector<ProviderResponse> responses);

}  // namespace cimhost
