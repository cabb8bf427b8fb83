#pragma once

#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <stdexcept>
#include <string>

namespace testsupport {

/**
 * The file that tests work on: the one that was built, or, where LAW_UNDER_TEST lists directories (separated by
 * colons), the one of the same name in the first that has it, with which the same tests look at an installation.
 * @throws std::runtime_error  none of those directories has it
 */
inline std::string underTest(const std::filesystem::path& built) {
    const char* list = std::getenv("LAW_UNDER_TEST");
    if (list == nullptr) {
        return built;
    }
    std::istringstream directories(list);
    for (std::string directory; std::getline(directories, directory, ':');) {
        const std::filesystem::path installed = directory / built.filename();
        if (std::filesystem::exists(installed)) {
            return installed;
        }
    }
    throw std::runtime_error("LAW_UNDER_TEST has no " + built.filename().string() + ": " + list);
}

}  // namespace testsupport
