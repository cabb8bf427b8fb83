#pragma once

#include <unistd.h>

#include <cerrno>
#include <string>
#include <utility>

namespace Agent {

/** Owns a file descriptor and closes it when destroyed. */
class FileDescriptor {
public:
    FileDescriptor() = default;
    explicit FileDescriptor(int openDescriptor) : descriptor(openDescriptor) {}
    FileDescriptor(FileDescriptor&& other) noexcept : descriptor(std::exchange(other.descriptor, -1)) {}
    FileDescriptor& operator=(FileDescriptor&& other) noexcept {
        const FileDescriptor old(std::exchange(descriptor, std::exchange(other.descriptor, -1)));
        return *this;
    }
    ~FileDescriptor() {
        if (descriptor >= 0) {
            ::close(descriptor);
        }
    }

    /** The descriptor; negative if nothing is open. */
    int get() const { return descriptor; }

private:
    int descriptor = -1;
};

/** The content of a file, or the error if it could not be read. */
struct FileContent {
    std::string text;
    int error = 0;  ///< errno value; 0 on success

    /** Whether the error is that the file does not exist. */
    bool absent() const { return error == ENOENT || error == ENOTDIR; }
};

/**
 * Reads a complete file. Does not block on pipes and terminals, and fails for files larger than 16 MiB, so that no path
 * can hang the process or exhaust its memory.
 */
FileContent readFile(const std::string& path);

/**
 * Appends the rest of an open file to a string. Fails if the string would exceed 16 MiB.
 * @return errno value; 0 on success
 */
int readRest(int file, std::string& text);

/** The operating system's message for an errno value. */
std::string errorText(int error);

}  // namespace Agent
