#pragma once

#include <filesystem>
#include <vector>

#include "cli/Arguments.h"

namespace cimhost {

/** The files that the program reads, and the directories of provider libraries. */
struct SearchPaths {
    std::vector<std::filesystem::path> schemas{};
    std::vector<std::filesystem::path> registrations{};
    std::vector<std::filesystem::path> gates{};  ///< files that replace registrations of the same classes
    std::vector<std::filesystem::path> libraryPaths{};
};

/**
 * Finds the files of each kind: those of the options, else of the environment variable, else of the installation or
 * build tree. For a directory, finds all its .mof or .reg files, sorted by name. Finds gates in the subdirectories
 * "gate" of registration directories, unless --provider, or else CIMHOST_PROVIDER, names the bare provider.
 * @throws UsageError if CIMHOST_PROVIDER has an unknown value
 * @throws LoadError if a directory cannot be read, a library directory does not exist, or a schema or registration is
 * missing
 */
SearchPaths findSearchPaths(const Arguments& arguments);

}  // namespace cimhost
