#pragma once

#include <string>

namespace Agent {

/** What reading a file gave: its text, or the reason why there is none. */
struct FileContent {
    std::string text;
    int error = 0;  ///< the errno value of the failure; 0 when the file was read

    /** Whether there is no such file, as opposed to one that cannot be read. */
    bool absent() const;
};

/**
 * Reads a whole file. Never waits (a pipe or terminal gives what is there) and refuses what is
 * larger than 16 MiB, so that no path, however badly chosen, can hang or exhaust the process.
 */
FileContent readFile(const std::string& path);

/**
 * Appends what is left of an open file to a text, within the same limit.
 * @return the errno value of the failure; 0 on success
 */
int readRest(int file, std::string& text);

/** The operating system's text for an errno value. */
std::string errorText(int error);

}  // namespace Agent
