#define _GNU_SOURCE
#include "Operations.h"

#include <dlfcn.h>
#include <errno.h>
#include <fcntl.h>
#include <stdarg.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <sys/uio.h>
#include <unistd.h>

#define VISIBLE __attribute__((visibility("default")))

static OperationHook currentHook;
static CreationObserver currentObserver;
static const char* absentDirectory;

void setOperationHook(OperationHook hook) {
    __atomic_store_n(&currentHook, hook, __ATOMIC_SEQ_CST);
}

void setCreationObserver(CreationObserver observer) {
    __atomic_store_n(&currentObserver, observer, __ATOMIC_SEQ_CST);
}

void setAbsentDirectory(const char* beginning) {
    __atomic_store_n(&absentDirectory, beginning, __ATOMIC_SEQ_CST);
}

static struct OperationFailure failureOf(enum OperationKind kind) {
    const struct OperationFailure done = {0, 0};
    const OperationHook hook = __atomic_load_n(&currentHook, __ATOMIC_SEQ_CST);
    return hook == NULL ? done : hook(kind);
}

static struct OperationFailure failureOfPath(enum OperationKind kind, const char* path) {
    struct OperationFailure failure = failureOf(kind);
    const char* absent = __atomic_load_n(&absentDirectory, __ATOMIC_SEQ_CST);
    if (failure.error == 0 && absent != NULL && strncmp(path, absent, strlen(absent)) == 0) {
        failure.error = ENOENT;
    }
    return failure;
}

static void notifyObserver(const char* path) {
    const CreationObserver observer = __atomic_load_n(&currentObserver, __ATOMIC_SEQ_CST);
    if (observer != NULL) {
        observer(path);
    }
}

/** The next definition of the function after this library's. */
#define NEXT(name) (__extension__(__typeof__(&name)) dlsym(RTLD_NEXT, #name))

/** Defines a function that fails or calls the next definition. */
#define INTERPOSE_WITH(lookup, failed, result, name, parameters, arguments) \
    VISIBLE result name parameters {                                        \
        const struct OperationFailure failure = lookup;                     \
        if (failure.error != 0) {                                           \
            errno = failure.error;                                          \
            return failed;                                                  \
        }                                                                   \
        return NEXT(name) arguments;                                        \
    }
#define INTERPOSE(kind, failed, result, name, parameters, arguments) \
    INTERPOSE_WITH(failureOf(kind), failed, result, name, parameters, arguments)
#define INTERPOSE_PATH(kind, failed, result, name, parameters, arguments) \
    INTERPOSE_WITH(failureOfPath(kind, path), failed, result, name, parameters, arguments)

/** Defines a function that closes: it closes the file even if it reports a failure. */
#define INTERPOSE_CLOSE(name, parameters, arguments)                       \
    VISIBLE int name parameters {                                          \
        const struct OperationFailure failure = failureOf(operationClose); \
        const int result = NEXT(name) arguments;                           \
        if (failure.error != 0) {                                          \
            errno = failure.error;                                         \
        }                                                                  \
        return failure.error != 0 ? -1 : result;                           \
    }

/** Defines a function whose last parameter, the mode of a new file, is present only if the flags require it. */
#define INTERPOSE_OPEN(name, parameters, first)                                     \
    VISIBLE int name parameters {                                                   \
        mode_t mode = 0;                                                            \
        if ((flags & (O_CREAT | __O_TMPFILE)) != 0) {                               \
            va_list rest;                                                           \
            va_start(rest, flags);                                                  \
            mode = va_arg(rest, mode_t);                                            \
            va_end(rest);                                                           \
        }                                                                           \
        const struct OperationFailure failure = failureOfPath(operationOpen, path); \
        if (failure.error != 0) {                                                   \
            errno = failure.error;                                                  \
            return -1;                                                              \
        }                                                                           \
        if ((flags & O_CREAT) != 0) {                                               \
            notifyObserver(path);                                                   \
        }                                                                           \
        return NEXT(name)(first, flags, mode);                                      \
    }

/** Defines a function that can succeed partially. */
#define INTERPOSE_TRANSFER(kind, failed, result, name, parameters, amount, arguments) \
    VISIBLE result name parameters {                                                  \
        const struct OperationFailure failure = failureOf(kind);                      \
        if (failure.error != 0) {                                                     \
            errno = failure.error;                                                    \
            return failed;                                                            \
        }                                                                             \
        if (failure.partly && amount > 1) {                                           \
            amount /= 2;                                                              \
        }                                                                             \
        return NEXT(name) arguments;                                                  \
    }

/** Defines a function that opens a stream with a mode string. */
#define INTERPOSE_STREAM_OPEN(name)                                                 \
    VISIBLE FILE* name(const char* path, const char* mode) {                        \
        const struct OperationFailure failure = failureOfPath(operationOpen, path); \
        if (failure.error != 0) {                                                   \
            errno = failure.error;                                                  \
            return NULL;                                                            \
        }                                                                           \
        if (mode[0] != 'r') {                                                       \
            notifyObserver(path);                                                   \
        }                                                                           \
        return NEXT(name)(path, mode);                                              \
    }

/** Defines a function that creates a temporary file. If there is an observer, the first name is predictable. */
#define INTERPOSE_TEMPORARY(name)                                                      \
    VISIBLE int name(char* pattern, int flags) {                                       \
        const struct OperationFailure failure = failureOfPath(operationOpen, pattern); \
        if (failure.error != 0) {                                                      \
            errno = failure.error;                                                     \
            return -1;                                                                 \
        }                                                                              \
        const int file = predictableTemporary(pattern, flags);                         \
        return file >= 0 ? file : NEXT(name)(pattern, flags);                          \
    }

/** Creates a temporary file like mkostemp, with a fixed name; returns a negative value if the name exists. */
static int predictableTemporary(char* pattern, int flags) {
    const size_t length = strlen(pattern);
    if (__atomic_load_n(&currentObserver, __ATOMIC_SEQ_CST) == NULL || length < 6) {
        return -1;
    }
    char* const varying = pattern + length - 6;
    memcpy(varying, "abcdef", 6);
    notifyObserver(pattern);
    const int file = NEXT(open)(pattern, O_RDWR | O_CREAT | O_EXCL | flags, 0600);
    if (file < 0) {
        memcpy(varying, "XXXXXX", 6);
    }
    return file;
}

/** Defines a function that allocates memory. Looks up the next definition once, since dlsym may allocate. */
#define INTERPOSE_ALLOCATION(name, parameters, arguments)                       \
    VISIBLE void* name parameters {                                             \
        static __typeof__(&name) next;                                          \
        const struct OperationFailure failure = failureOf(operationTakeMemory); \
        if (failure.error != 0) {                                               \
            errno = failure.error;                                              \
            return NULL;                                                        \
        }                                                                       \
        if (__atomic_load_n(&next, __ATOMIC_RELAXED) == NULL) {                 \
            __atomic_store_n(&next, NEXT(name), __ATOMIC_RELAXED);              \
        }                                                                       \
        return __atomic_load_n(&next, __ATOMIC_RELAXED) arguments;              \
    }

/** Defines a function that does nothing instead of syncing: no test simulates a power failure, and syncing is slow. */
#define INTERPOSE_SYNC(name)                                              \
    VISIBLE int name(int file) {                                          \
        const struct OperationFailure failure = failureOf(operationSync); \
        (void)file;                                                       \
        errno = failure.error != 0 ? failure.error : errno;               \
        return failure.error != 0 ? -1 : 0;                               \
    }

/** Defines a function that locks a file. Its other commands do not fail. */
#define INTERPOSE_LOCK(name)                                                    \
    VISIBLE int name(int file, int command, ...) {                              \
        va_list rest;                                                           \
        va_start(rest, command);                                                \
        void* const argument = va_arg(rest, void*);                             \
        va_end(rest);                                                           \
        const struct OperationFailure failure = failureOf(operationLock);       \
        if (failure.error != 0 && (command == F_SETLK || command == F_GETLK)) { \
            errno = failure.error;                                              \
            return -1;                                                          \
        }                                                                       \
        return NEXT(name)(file, command, argument);                             \
    }

#ifndef LAW_SANITIZE
INTERPOSE_ALLOCATION(malloc, (size_t size), (size))
INTERPOSE_ALLOCATION(calloc, (size_t count, size_t size), (count, size))
INTERPOSE_ALLOCATION(realloc, (void* memory, size_t size), (memory, size))
#endif

#define BOTH(first, second) first, second

INTERPOSE_OPEN(open, (const char* path, int flags, ...), path)
INTERPOSE_OPEN(open64, (const char* path, int flags, ...), path)
INTERPOSE_OPEN(openat, (int directory, const char* path, int flags, ...), BOTH(directory, path))
INTERPOSE_OPEN(openat64, (int directory, const char* path, int flags, ...), BOTH(directory, path))
INTERPOSE_TEMPORARY(mkostemp)
INTERPOSE_TEMPORARY(mkostemp64)
INTERPOSE_STREAM_OPEN(fopen)
INTERPOSE_STREAM_OPEN(fopen64)
INTERPOSE(operationOpen, NULL, FILE*, fdopen, (int file, const char* mode), (file, mode))
INTERPOSE(operationOpen, -1, int, socket, (int domain, int type, int protocol), (domain, type, protocol))
INTERPOSE_PATH(operationOpen, -1, int, mkdir, (const char* path, mode_t mode), (path, mode))

INTERPOSE_TRANSFER(operationRead, -1, ssize_t, read, (int file, void* data, size_t size), size, (file, data, size))
INTERPOSE_TRANSFER(operationWrite, -1, ssize_t, write, (int file, const void* data, size_t size), size,
                   (file, data, size))
INTERPOSE_TRANSFER(operationWrite, -1, ssize_t, writev, (int file, const struct iovec* parts, int count), count,
                   (file, parts, count))
INTERPOSE_TRANSFER(operationWrite, 0, size_t, fwrite, (const void* data, size_t size, size_t count, FILE* file), count,
                   (data, size, count, file))
INTERPOSE(operationWrite, -1, ssize_t, sendto,
          (int file, const void* data, size_t size, int flags, __CONST_SOCKADDR_ARG address, socklen_t length),
          (file, data, size, flags, address, length))
INTERPOSE(operationWrite, EOF, int, fflush, (FILE * file), (file))
INTERPOSE(operationSeek, -1, off_t, lseek, (int file, off_t offset, int whence), (file, offset, whence))
INTERPOSE(operationSeek, -1, off64_t, lseek64, (int file, off64_t offset, int whence), (file, offset, whence))
INTERPOSE_SYNC(fsync)
INTERPOSE(operationRename, -1, int, rename, (const char* from, const char* to), (from, to))
INTERPOSE(operationRemove, -1, int, unlink, (const char* path), (path))
INTERPOSE(operationRemove, -1, int, remove, (const char* path), (path))
INTERPOSE_CLOSE(close, (int file), (file))
INTERPOSE_CLOSE(fclose, (FILE * file), (file))
INTERPOSE_PATH(operationStatus, -1, int, stat, (const char* path, struct stat* status), (path, status))
INTERPOSE_PATH(operationStatus, -1, int, stat64, (const char* path, struct stat64* status), (path, status))
INTERPOSE(operationStatus, -1, int, fstat, (int file, struct stat* status), (file, status))
INTERPOSE(operationStatus, -1, int, fstat64, (int file, struct stat64* status), (file, status))
INTERPOSE_PATH(operationStatus, -1, int, statvfs, (const char* path, struct statvfs* status), (path, status))
INTERPOSE_PATH(operationStatus, -1, int, access, (const char* path, int mode), (path, mode))
INTERPOSE(operationWrite, -1, int, ftruncate, (int file, off_t length), (file, length))
INTERPOSE_PATH(operationWrite, -1, int, truncate, (const char* path, off_t length), (path, length))
INTERPOSE_PATH(operationWrite, -1, int, truncate64, (const char* path, off64_t length), (path, length))
INTERPOSE_LOCK(fcntl)
INTERPOSE_LOCK(fcntl64)
INTERPOSE(operationAttributes, -1, int, fchmod, (int file, mode_t mode), (file, mode))
INTERPOSE(operationAttributes, -1, int, fchown, (int file, uid_t owner, gid_t group), (file, owner, group))
INTERPOSE_PATH(operationResolve, NULL, char*, realpath, (const char* path, char* resolved), (path, resolved))
