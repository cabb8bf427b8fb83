#pragma once

#include <filesystem>
#include <vector>

#include "cli/Arguments.h"

namespace cimhost {

/** The files that the program reads, and the directories of provider libraries. */
struct SearchPaths {
    std::vector<std::filesystem::path> schemas{};
    std::vector<std::filesystem::path> registrations{};
    std::vector<std::filesystem::path> gates{};  ///< registrations that replace others of the same classes
    std::vector<std::filesystem::path> libraryPaths{};
};

/**
 * Finds the files of each kind: those of the options, or of the environment variable, or of the installation or build
 * tree. Of a directory, all .mof or .reg files, sorted by name. The gates are in subdirectories "gate" of the
 * directories of registrations; there are none if the option or environment variable for it names the bare provider.
 * @throws UsageError if the environment variable for the provider has an unknown value
 * @throws LoadError if a file or directory does not exist, or if there is no schema or registration
 */
SearchPaths findSearchPaths(const Arguments& arguments);

}  // namespace cimhost
