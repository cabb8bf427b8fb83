#pragma once

#include <filesystem>
#include <string>
#include <string_view>

namespace testsupport {

/** A new temporary directory, which the destructor removes. */
class TempDirectory {
public:
    /** In testing::TempDir(). */
    TempDirectory();
    explicit TempDirectory(const std::filesystem::path& parent);
    ~TempDirectory();
    TempDirectory(const TempDirectory&) = delete;
    TempDirectory& operator=(const TempDirectory&) = delete;

    const std::filesystem::path& path() const { return directory; }

    /** The path with a slash at the end, like the agent's directories. */
    std::string withSlash() const { return directory.string() + "/"; }

private:
    std::filesystem::path directory;
};

/** Returns the content of a file. @throws std::runtime_error if it cannot be read */
std::string readFile(const std::filesystem::path& file);

/** Replaces the content of a file. @throws std::runtime_error if it cannot be written */
void writeFile(const std::filesystem::path& file, std::string_view content);

}  // namespace testsupport
