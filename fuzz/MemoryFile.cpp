#include "MemoryFile.h"

#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <system_error>

namespace fuzz {

namespace {

void requireDone(bool isDone, const char* what) {
    if (!isDone) {
        throw std::system_error(errno, std::generic_category(), what);
    }
}

}  // namespace

MemoryFile::MemoryFile()
    : number(memfd_create("fuzz", MFD_CLOEXEC)), itsPath("/proc/self/fd/" + std::to_string(number)) {
    requireDone(number >= 0, "memfd_create");
}

MemoryFile::~MemoryFile() {
    close(number);
}

void MemoryFile::fill(std::string_view content) {
    requireDone(ftruncate(number, 0) == 0, "ftruncate");
    const auto size = static_cast<ssize_t>(content.size());
    requireDone(pwrite(number, content.data(), content.size(), 0) == size, "pwrite");
}

std::string MemoryFile::content() const {
    struct stat status {};
    requireDone(fstat(number, &status) == 0, "fstat");
    std::string content(static_cast<std::size_t>(status.st_size), '\0');
    requireDone(pread(number, content.data(), content.size(), 0) == status.st_size, "pread");
    return content;
}

}  // namespace fuzz
