#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include "cli/Arguments.h"

namespace cimhost {

/** The files that the program reads, and the directories of provider libraries. */
struct SearchPaths {
    std::vector<std::filesystem::path> schemas{};
    std::vector<std::filesystem::path> registrations{};
    std::vector<std::filesystem::path> libraryPaths{};
};

/**
 * Takes each kind from the options, else from its environment variable, else from the directories of the installation
 * or the build tree. A directory means all its .mof or .reg files in the order of their names.
 * LoadError when a named one does not exist, or when there is no schema or registration.
 */
SearchPaths findSearchPaths(const Arguments& arguments);

}  // namespace cimhost
