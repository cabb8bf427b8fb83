#pragma once

#include <unistd.h>

#include <utility>

namespace Agent {

/** An open file descriptor, closed when its owner is destroyed. */
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

}  // namespace Agent
