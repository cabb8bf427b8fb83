#pragma once

#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <stdexcept>
#include <string>

namespace testsupport {

/**
 * The file to test: the built one or, if LAW_UNDER_TEST is a list of directories (separated by colons), the file of the
 * same name in the first directory that contains it, so that the tests can run with an installation.
 * @throws std::runtime_error if none of the directories contains it
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
