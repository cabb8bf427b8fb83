#pragma once

#include "lab/load/Plan.h"
#include "lab/load/Report.h"
#include "operations/ObjectManager.h"

namespace cimhost::lab {

/**
 * Lets many clients, each on a thread of its own, send requests at a time, checks every answer, in the end also that
 * what is there is what the clients were told, and deletes it unless the plan keeps it.
 * @return a status other than OK when how things were before the load cannot be asked for
 * @throws PlanError when the plan is not feasible, LibraryError when a provider cannot be loaded
 */
StatusOr<Report> runLoad(ObjectManager& manager, const Plan& plan);

}  // namespace cimhost::lab
