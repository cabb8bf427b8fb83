#include "configuration/FileContent.h"

#include <fcntl.h>
#include <unistd.h>

#include <system_error>

namespace Agent {

namespace {

constexpr std::size_t largestFile = 16U << 20U;

}  // namespace

int readRest(int file, std::string& text) {
    char block[8192];
    for (;;) {
        const ssize_t count = ::read(file, block, sizeof block);
        if (count < 0 && errno == EINTR) {
            continue;
        }
        if (count < 0) {
            return errno;
        }
        if (count == 0) {
            return 0;
        }
        if (text.size() + static_cast<std::size_t>(count) > largestFile) {
            return EFBIG;
        }
        text.append(block, static_cast<std::size_t>(count));
    }
}

FileContent readFile(const std::string& path) {
    FileContent content;
    if (path.find('\0') != std::string::npos) {
        content.error = EINVAL;
        return content;
    }
    const FileDescriptor file(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY));
    if (file.get() < 0) {
        content.error = errno;
        return content;
    }
    content.error = readRest(file.get(), content.text);
    if (content.error != 0) {
        content.text.clear();
    }
    return content;
}

std::string errorText(int error) {
    return std::generic_category().message(error);
}

}  // namespace Agent
