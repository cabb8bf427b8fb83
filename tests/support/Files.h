#pragma once

#include <filesystem>
#include <string>
#include <string_view>

namespace testsupport {

/** A new, empty folder of this test's own, removed with all it contains at the end. */
class TempDirectory {
public:
    /** In testing::TempDir(). */
    TempDirectory();
    explicit TempDirectory(const std::filesystem::path& parent);
    ~TempDirectory();
    TempDirectory(const TempDirectory&) = delete;
    TempDirectory& operator=(const TempDirectory&) = delete;

    const std::filesystem::path& path() const { return folder; }

    /** The folder as text that ends in a slash, as the agent's folders do. */
    std::string withSlash() const { return folder.string() + "/"; }

private:
    std::filesystem::path folder;
};

/** The whole file, byte by byte. std::runtime_error when it cannot be read. */
std::string readFile(const std::filesystem::path& file);

/** Replaces the content of the file. Throws std::runtime_error if it cannot be written. */
void writeFile(const std::filesystem::path& file, std::string_view content);

}  // namespace testsupport
