#pragma once

#include <functional>
#include <memory>

#include "lab/emulation/RequestAdaptation.h"
#include "operations/ManagerBehaviour.h"

// The emulation of each object manager, and their common parts.

namespace cimhost::lab {

std::shared_ptr<const ManagerBehaviour> sfcbEmulation();
std::shared_ptr<const ManagerBehaviour> openPegasusEmulation(CreationKey creationKey);

/** Versions and gaps of SFCB's tables. */
void changeToSfcbTables(FunctionTables& tables);

/** The status of a request that would have ended the manager's provider process. */
Status crashed(const std::string& reason);

}  // namespace cimhost::lab
