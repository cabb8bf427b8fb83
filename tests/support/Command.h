#pragma once

#include <sys/wait.h>

#include <cstdio>
#include <ostream>
#include <stdexcept>
#include <string>

namespace testsupport {

/** How a command has ended. */
struct Ended {
    int status = -1;     ///< exit status; -1: ended by a signal
    std::string output;  ///< both streams
};

inline void PrintTo(const Ended& ended, std::ostream* stream) {
    *stream << "status " << ended.status << ": " << ended.output;
}

/** Runs a shell command, or several, until they end. */
inline Ended runCommand(const std::string& command) {
    FILE* pipe = popen(("exec 2>&1; " + command).c_str(), "r");
    if (pipe == nullptr) {
        throw std::runtime_error("no pipe");
    }
    Ended ended;
    for (int character = std::fgetc(pipe); character != EOF; character = std::fgetc(pipe)) {
        ended.output += static_cast<char>(character);
    }
    const int status = pclose(pipe);
    ended.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    return ended;
}

}  // namespace testsupport
