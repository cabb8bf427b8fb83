#pragma once

#include <sys/types.h>

#include <cstddef>
#include <string>
#include <vector>

// Records operations on files in the data directory, including those of the libraries under test.

namespace gatetest {

enum class Kind { create, rename, remove, syncNames, truncate, write, sync };

/** An operation on a file of the data directory. */
struct Event {
    Kind kind;
    ino_t file;            ///< 0 if the file was removed; the directory for syncNames
    std::string name{};    ///< of a file that was created, renamed or removed
    std::string target{};  ///< new name of a renamed file
    std::string data{};
    std::size_t offset = 0;  ///< of a write; the size after a truncation
};

/** Returns the inode number of a file; 0 if the file does not exist. */
ino_t inodeOf(const std::string& path);

/** Records operations during its lifetime. */
struct Recording {
    static inline std::vector<Event>* events = nullptr;

    Recording() { events = &recorded; }
    ~Recording() { events = nullptr; }
    Recording(const Recording&) = delete;
    Recording& operator=(const Recording&) = delete;

    std::vector<Event> recorded;
};

}  // namespace gatetest
