#pragma once

#include <filesystem>
#include <string>
#include <string_view>

namespace testsupport {

/** Returns the content of a file. @throws std::runtime_error if it cannot be read */
std::string readFile(const std::filesystem::path& file);

/** Replaces the content of a file. @throws std::runtime_error if it cannot be written */
void writeFile(const std::filesystem::path& file, std::string_view content);

}  // namespace testsupport
