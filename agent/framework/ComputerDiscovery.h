#pragma once

#include "configuration/TableReader.h"
#include "framework/NodeTree.h"

#include <string>

namespace KO {

/** This computer's name on the network; "localhost" when the system does not tell it. */
std::string hostName();

/**
 * The nodes of this computer: the system, and below it the computer, both with its name, vendor and
 * product name.
 * @param dmiRoot directory of the kernel's DMI files, ending with a separator
 * @param name    the computer's name
 * @param problems receives a sentence for each file that is there and cannot be read
 */
NodeTree discoverComputer(const std::string& dmiRoot, const std::string& name, Agent::Problems& problems);

}  // namespace KO
