#include "FileEvents.h"

#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/uio.h>
#include <unistd.h>

#include <array>
#include <cstdarg>
#include <cstdio>
#include <filesystem>

#include "support/AgentEnvironment.h"

namespace gatetest {

ino_t inodeOf(const std::string& path) {
    struct stat status {};
    return stat(path.c_str(), &status) == 0 ? status.st_ino : 0;
}

namespace {

namespace fs = std::filesystem;

/** Returns the name of a file in the data directory, "/" for the directory itself, otherwise an empty string. */
std::string nameOf(const std::string& path) {
    const fs::path directory = agentEnvironment::dataDirectory();
    const fs::path file = fs::path(path).lexically_normal();
    if (file == directory || file == directory / "") {
        return "/";
    }
    return file.parent_path() == directory ? file.filename().string() : std::string();
}

std::string nameOf(int descriptor) {
    std::array<char, 4096> path{};
    const std::string link = "/proc/self/fd/" + std::to_string(descriptor);
    const ssize_t size = readlink(link.c_str(), path.data(), path.size());
    return size > 0 ? nameOf(std::string(path.data(), static_cast<std::size_t>(size))) : std::string();
}

ino_t inodeOfDescriptor(int descriptor) {
    struct stat status {};
    return fstat(descriptor, &status) == 0 ? status.st_ino : 0;
}

void record(Event event) {
    if (Recording::events != nullptr) {
        Recording::events->push_back(std::move(event));
    }
}

bool isRecorded(const std::string& name) {
    return Recording::events != nullptr && !name.empty() && name != "owner";
}

/** Records that opening a file created or truncated it. @param existed whether the file existed before */
void recordOpening(const char* path, bool existed, bool truncates) {
    const std::string name = nameOf(std::string(path));
    if (!isRecorded(name) || inodeOf(std::string(path)) == 0) {
        return;
    }
    if (!existed) {
        record({Kind::create, inodeOf(std::string(path)), name});
    } else if (truncates) {
        record({Kind::truncate, inodeOf(std::string(path))});
    }
}

/** Records data that was just written, up to the current position of a file. */
void recordWriting(int descriptor, std::string data) {
    if (Recording::events != nullptr && isRecorded(nameOf(descriptor))) {
        const auto offset = static_cast<std::size_t>(lseek(descriptor, 0, SEEK_CUR)) - data.size();
        record({Kind::write, inodeOfDescriptor(descriptor), {}, {}, std::move(data), offset});
    }
}

void recordSync(int descriptor) {
    const std::string name = nameOf(descriptor);
    if (isRecorded(name)) {
        record({name == "/" ? Kind::syncNames : Kind::sync, inodeOfDescriptor(descriptor)});
    }
}

}  // namespace
}  // namespace gatetest

// These functions replace those of the C library, also for the libraries under test.

namespace {

using namespace gatetest;

template <class Function>
Function* next(const char* name) {
    return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

FILE* openStream(const char* function, const char* path, const char* mode) {
    const bool existed = access(path, F_OK) == 0;
    FILE* stream = next<FILE*(const char*, const char*)>(function)(path, mode);
    if (stream != nullptr && *mode == 'w') {
        recordOpening(path, existed, true);
    }
    return stream;
}

int openFile(const char* function, const char* path, int flags, mode_t mode) {
    const bool existed = access(path, F_OK) == 0;
    const int descriptor = next<int(const char*, int, ...)>(function)(path, flags, mode);
    if (descriptor >= 0 && (flags & (O_CREAT | O_TRUNC)) != 0) {
        recordOpening(path, existed, (flags & O_TRUNC) != 0);
    }
    return descriptor;
}

mode_t modeIn(int flags, va_list rest) {
    return (flags & O_CREAT) != 0 ? va_arg(rest, mode_t) : 0;
}

}  // namespace

#define VISIBLE extern "C" __attribute__((visibility("default")))

VISIBLE FILE* fopen(const char* path, const char* mode) {
    return openStream("fopen", path, mode);
}

VISIBLE FILE* fopen64(const char* path, const char* mode) {
    return openStream("fopen64", path, mode);
}

VISIBLE int open(const char* path, int flags, ...) {
    va_list rest;
    va_start(rest, flags);
    const mode_t mode = modeIn(flags, rest);
    va_end(rest);
    return openFile("open", path, flags, mode);
}

VISIBLE int open64(const char* path, int flags, ...) {
    va_list rest;
    va_start(rest, flags);
    const mode_t mode = modeIn(flags, rest);
    va_end(rest);
    return openFile("open64", path, flags, mode);
}

VISIBLE ssize_t write(int file, const void* data, size_t size) {
    const ssize_t count = next<ssize_t(int, const void*, size_t)>("write")(file, data, size);
    if (count > 0) {
        recordWriting(file, std::string(static_cast<const char*>(data), static_cast<std::size_t>(count)));
    }
    return count;
}

VISIBLE ssize_t writev(int file, const struct iovec* parts, int count) {
    std::string data;
    for (int part = 0; part < count; ++part) {
        data.append(static_cast<const char*>(parts[part].iov_base), parts[part].iov_len);
    }
    const ssize_t written = next<ssize_t(int, const struct iovec*, int)>("writev")(file, parts, count);
    if (written > 0) {
        recordWriting(file, data.substr(0, static_cast<std::size_t>(written)));
    }
    return written;
}

VISIBLE int fsync(int file) {
    recordSync(file);
    return 0;  // a real sync would only be slow
}

VISIBLE int fdatasync(int file) {
    recordSync(file);
    return 0;
}

VISIBLE int rename(const char* from, const char* to) noexcept {
    const ino_t file = inodeOf(std::string(from));
    const int result = next<int(const char*, const char*)>("rename")(from, to);
    if (result == 0 && isRecorded(nameOf(std::string(to)))) {
        record({Kind::rename, file, nameOf(std::string(from)), nameOf(std::string(to))});
    }
    return result;
}

VISIBLE int unlink(const char* path) noexcept {
    const int result = next<int(const char*)>("unlink")(path);
    if (result == 0 && isRecorded(nameOf(std::string(path)))) {
        record({Kind::remove, 0, nameOf(std::string(path))});
    }
    return result;
}

VISIBLE int truncate(const char* path, off_t size) noexcept {
    const int result = next<int(const char*, off_t)>("truncate")(path, size);
    if (result == 0 && isRecorded(nameOf(std::string(path)))) {
        record({Kind::truncate, inodeOf(std::string(path)), {}, {}, {}, static_cast<std::size_t>(size)});
    }
    return result;
}

VISIBLE int ftruncate(int file, off_t size) noexcept {
    const int result = next<int(int, off_t)>("ftruncate")(file, size);
    if (result == 0 && isRecorded(nameOf(file))) {
        record({Kind::truncate, inodeOfDescriptor(file), {}, {}, {}, static_cast<std::size_t>(size)});
    }
    return result;
}
