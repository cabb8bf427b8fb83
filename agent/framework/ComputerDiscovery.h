#pragma once

#include <string>

#include "configuration/TableReader.h"
#include "framework/NodeTree.h"

namespace KO {

/** Returns this computer's host name; "localhost" if the system has none. */
std::string hostName();

/**
 * The nodes of this computer: the system, and below it the computer, both with its name, vendor and
 * product name.
 * @param dmiRoot directory of the kernel's DMI files, ending with a separator
 * @param name    the computer's name
 * @param problems receives a sentence for each existing file that cannot be read
 */
NodeTree discoverComputer(const std::string& dmiRoot, const std::string& name, Agent::Problems& problems);

}  // namespace KO
