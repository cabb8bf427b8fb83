#pragma once

#include "cli/Commands.h"
#include "operations/ObjectManager.h"
#include "schema/Schema.h"

namespace cimhost {

/**
 * Runs the load that the arguments ask for and reports it; wrong answers are the outcome's complaint.
 * UsageError and PathError for a load that cannot be run.
 */
Outcome runLoadCommand(ObjectManager& manager, const Arguments& arguments, const Schema& schema);

}  // namespace cimhost
