#pragma once

#include <functional>
#include <memory>

#include "lab/emulation/RequestAdaptation.h"
#include "operations/ManagerBehaviour.h"

// The emulations of object managers, and their common parts.

namespace cimhost::lab {

std::shared_ptr<const ManagerBehaviour> sfcbEmulation();
std::shared_ptr<const ManagerBehaviour> openPegasusEmulation(CreationKey creationKey);

/** Sets the versions of SFCB's tables, and removes the functions that SFCB does not have. */
void changeToSfcbTables(FunctionTables& tables);

/** The status of a request that would have ended the manager's provider process. */
Status crashed(const std::string& reason);

}  // namespace cimhost::lab
