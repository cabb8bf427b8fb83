#pragma once

#include <string>
#include <string_view>

namespace fuzz {

/** A file in memory with a path, so that it can be opened, read and rewritten like any file. */
class MemoryFile {
public:
    /** @throws std::system_error if the system cannot create it */
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
