#include "LockErrors.h"

#include <dlfcn.h>
#include <fcntl.h>

#include <cerrno>
#include <cstdarg>

namespace {

int control(const char* function, int file, int command, void* argument) {
    if (command == F_SETLK && durable::LockErrors::count > 0) {
        --durable::LockErrors::count;
        errno = durable::LockErrors::error;
        return -1;
    }
    const auto next = reinterpret_cast<int (*)(int, int, ...)>(dlsym(RTLD_NEXT, function));
    return next(file, command, argument);
}

}  // namespace

// Replace the C library's functions.

extern "C" int fcntl(int file, int command, ...) {
    va_list rest;
    va_start(rest, command);
    void* const argument = va_arg(rest, void*);
    va_end(rest);
    return control("fcntl", file, command, argument);
}

extern "C" int fcntl64(int file, int command, ...) {
    va_list rest;
    va_start(rest, command);
    void* const argument = va_arg(rest, void*);
    va_end(rest);
    return control("fcntl64", file, command, argument);
}
