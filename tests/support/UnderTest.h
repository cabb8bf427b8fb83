#pragma once

#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <string>

namespace testsupport {

/**
 * The file that tests work on: the one that was built, or the one of the same name in a directory that LAW_UNDER_TEST
 * lists (separated by colons), with which the same tests look at an installation.
 */
inline std::string underTest(const std::filesystem::path& built) {
    const char* list = std::getenv("LAW_UNDER_TEST");
    std::istringstream directories(list == nullptr ? "" : list);
    for (std::string directory; std::getline(directories, directory, ':');) {
        const std::filesystem::path installed = directory / built.filename();
        if (std::filesystem::exists(installed)) {
            return installed;
        }
    }
    return built;
}

}  // namespace testsupport
