#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string>
#include <system_error>

namespace testsupport {

/** A new temporary directory, removed with its content by the destructor. */
class TemporaryDirectory {
public:
    explicit TemporaryDirectory(const std::filesystem::path& parent = testing::TempDir()) {
        std::string pattern = (parent / "law-XXXXXX").string();
        if (mkdtemp(pattern.data()) == nullptr) {
            throw std::runtime_error("cannot create a directory like " + pattern);
        }
        directory = pattern;
    }
    ~TemporaryDirectory() {
        std::error_code ignored;
        std::filesystem::remove_all(directory, ignored);
    }
    TemporaryDirectory(const TemporaryDirectory&) = delete;
    TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

    const std::filesystem::path& path() const { return directory; }

    /** The path with a slash at the end, like the agent's directories. */
    std::string withSlash() const { return directory.string() + "/"; }

    /** Path of a file in it. */
    std::string file(const std::string& name) const { return directory / name; }

    /** Writes a file in it, with the folders of its name. @return its path */
    std::string write(const std::string& name, const std::string& content) const {
        std::filesystem::create_directories((directory / name).parent_path());
        std::ofstream(file(name), std::ios::binary) << content;
        return file(name);
    }

    /** Content of a file in it; empty if there is none. */
    std::string read(const std::string& name) const {
        std::ifstream stream(file(name), std::ios::binary);
        return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
    }

private:
    std::filesystem::path directory;
};

}  // namespace testsupport
