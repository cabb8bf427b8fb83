#pragma once

#include <string>
#include <string_view>

namespace fuzz {

/** A file that is only in memory, and yet has a path by which it can be opened, read and rewritten. */
class MemoryFile {
public:
    /** @throws std::system_error when the operating system has none */
    MemoryFile();
    ~MemoryFile();
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;

    const std::string& path() const { return itsPath; }

    void fill(std::string_view content);
    std::string content() const;

private:
    int number;
    std::string itsPath;
};

}  // namespace fuzz
