#pragma once

#include "lab/load/Plan.h"
#include "lab/load/Report.h"
#include "operations/ObjectManager.h"

namespace cimhost::lab {

/**
 * Sends requests of many concurrent clients, one thread per client, and checks all responses. At the end, checks the
 * instances against the expected state of all clients, and deletes them unless the plan keeps them.
 * @return a status other than OK if the initial state cannot be read
 * @throws PlanError if the plan is not possible, LibraryError if a provider cannot be loaded
 */
StatusOr<Report> runLoad(ObjectManager& manager, const Plan& plan);

}  // namespace cimhost::lab
