#pragma once

#include <string>

namespace Agent {

/** The content of a file, or the error of reading it. */
struct FileContent {
    std::string text;
    int error = 0;  ///< errno value; 0 on success

    /** Whether the file does not exist, as opposed to one that cannot be read. */
    bool absent() const;
};

/**
 * Reads a complete file. Does not block on pipes and terminals, and fails for files larger than 16 MiB, so that no path
 * can hang the process or exhaust its memory.
 */
FileContent readFile(const std::string& path);

/**
 * Appends the rest of an open file to a string, within the same limit.
 * @return errno value; 0 on success
 */
int readRest(int file, std::string& text);

/** The operating system's message for an errno value. */
std::string errorText(int error);

}  // namespace Agent
