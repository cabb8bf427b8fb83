#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include "cli/Arguments.h"

namespace cimhost {

/** The files and directories that a run works with. */
struct Locations {
    std::vector<std::filesystem::path> schemas{};
    std::vector<std::filesystem::path> registrations{};
    std::vector<std::filesystem::path> libraryPaths{};
};

/**
 * Takes each kind from the options; without any from its environment variable; without that from where the program
 * is installed or was built. A directory stands for all its .mof or .reg files in the order of their names.
 * LoadError when one that was named does not exist, or when there is no schema or registration at all.
 */
Locations findLocations(const Arguments& arguments);

}  // namespace cimhost
