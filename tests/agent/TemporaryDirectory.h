#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

namespace agent_test {

/** A temporary directory, removed with its content by the destructor. */
class TemporaryDirectory {
public:
    TemporaryDirectory() : name(testing::TempDir() + "agent-XXXXXX") {
        if (::mkdtemp(name.data()) == nullptr) {
            std::abort();
        }
        name += '/';
    }
    ~TemporaryDirectory() {
        std::error_code ignored;
        std::filesystem::remove_all(name, ignored);
    }
    TemporaryDirectory(const TemporaryDirectory&) = delete;
    TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

    /** Path of the directory, ending with a separator. */
    const std::string& path() const { return name; }

    /** Path of a file in it. */
    std::string file(const std::string& fileName) const { return name + fileName; }

    /** Writes a file in it. @return its path */
    std::string write(const std::string& fileName, const std::string& content) const {
        std::ofstream(file(fileName), std::ios::binary) << content;
        return file(fileName);
    }

    /** Content of a file in it; empty if there is none. */
    std::string read(const std::string& fileName) const {
        std::ifstream stream(file(fileName), std::ios::binary);
        return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
    }

private:
    std::string name;
};

}  // namespace agent_test
