#define _GNU_SOURCE
#include "Operations.h"

#include <dlfcn.h>
#include <errno.h>
#include <fcntl.h>
#include <stdarg.h>
#include <stdio.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <sys/uio.h>
#include <unistd.h>

static OperationJudge currentJudge;

void setOperationJudge(OperationJudge judge) {
    __atomic_store_n(&currentJudge, judge, __ATOMIC_SEQ_CST);
}

static struct OperationVerdict verdictOn(enum OperationKind kind) {
    const struct OperationVerdict done = {0, 0};
    const OperationJudge judge = __atomic_load_n(&currentJudge, __ATOMIC_SEQ_CST);
    return judge == NULL ? done : judge(kind);
}

/** The function of that name behind this library. */
#define NEXT(name) (__extension__(__typeof__(&name)) dlsym(RTLD_NEXT, #name))

/** A function that fails as a whole or is passed on. */
#define STAND_BEFORE(kind, failed, result, name, parameters, arguments) \
    __attribute__((visibility("default"))) result name parameters {     \
        const struct OperationVerdict verdict = verdictOn(kind);        \
        if (verdict.error != 0) {                                       \
            errno = verdict.error;                                      \
            return failed;                                              \
        }                                                               \
        return NEXT(name) arguments;                                    \
    }

/** One that closes: a failure is told after it. */
#define STAND_BEFORE_CLOSING(name, parameters, arguments)                  \
    __attribute__((visibility("default"))) int name parameters {           \
        const struct OperationVerdict verdict = verdictOn(operationClose); \
        const int result = NEXT(name) arguments;                           \
        if (verdict.error != 0) {                                          \
            errno = verdict.error;                                         \
        }                                                                  \
        return verdict.error != 0 ? -1 : result;                           \
    }

/** One whose last parameter, the mode of a new file, is there only if the flags ask for one. */
#define STAND_BEFORE_OPENING(name, parameters, first)                     \
    __attribute__((visibility("default"))) int name parameters {          \
        mode_t mode = 0;                                                  \
        if ((flags & (O_CREAT | __O_TMPFILE)) != 0) {                     \
            va_list rest;                                                 \
            va_start(rest, flags);                                        \
            mode = va_arg(rest, mode_t);                                  \
            va_end(rest);                                                 \
        }                                                                 \
        const struct OperationVerdict verdict = verdictOn(operationOpen); \
        if (verdict.error != 0) {                                         \
            errno = verdict.error;                                        \
            return -1;                                                    \
        }                                                                 \
        return NEXT(name)(first, flags, mode);                            \
    }

/** One that may be done in part. */
#define STAND_BEFORE_TRANSFER(kind, name, parameters, amount, arguments) \
    __attribute__((visibility("default"))) ssize_t name parameters {     \
        const struct OperationVerdict verdict = verdictOn(kind);         \
        if (verdict.error != 0) {                                        \
            errno = verdict.error;                                       \
            return -1;                                                   \
        }                                                                \
        if (verdict.partly && amount > 1) {                              \
            amount /= 2;                                                 \
        }                                                                \
        return NEXT(name) arguments;                                     \
    }

#define BOTH(first, second) first, second

STAND_BEFORE_OPENING(open, (const char* path, int flags, ...), path)
STAND_BEFORE_OPENING(open64, (const char* path, int flags, ...), path)
STAND_BEFORE_OPENING(openat, (int directory, const char* path, int flags, ...), BOTH(directory, path))
STAND_BEFORE_OPENING(openat64, (int directory, const char* path, int flags, ...), BOTH(directory, path))
STAND_BEFORE(operationOpen, -1, int, mkostemp, (char* pattern, int flags), (pattern, flags))
STAND_BEFORE(operationOpen, -1, int, mkostemp64, (char* pattern, int flags), (pattern, flags))
STAND_BEFORE(operationOpen, NULL, FILE*, fopen, (const char* path, const char* mode), (path, mode))
STAND_BEFORE(operationOpen, NULL, FILE*, fopen64, (const char* path, const char* mode), (path, mode))

STAND_BEFORE_TRANSFER(operationRead, read, (int file, void* data, size_t size), size, (file, data, size))
STAND_BEFORE_TRANSFER(operationWrite, write, (int file, const void* data, size_t size), size, (file, data, size))
STAND_BEFORE_TRANSFER(operationWrite, writev, (int file, const struct iovec* parts, int count), count,
                      (file, parts, count))
STAND_BEFORE(operationWrite, 0, size_t, fwrite, (const void* data, size_t size, size_t count, FILE* file),
             (data, size, count, file))
STAND_BEFORE(operationWrite, EOF, int, fflush, (FILE * file), (file))

/** Nothing is forced to the disk: no test looks at it after a loss of power, and each would wait for it. */
#define STAND_FOR_SYNC(name)                                              \
    __attribute__((visibility("default"))) int name(int file) {           \
        const struct OperationVerdict verdict = verdictOn(operationSync); \
        (void)file;                                                       \
        errno = verdict.error != 0 ? verdict.error : errno;               \
        return verdict.error != 0 ? -1 : 0;                               \
    }

STAND_FOR_SYNC(fsync)
STAND_FOR_SYNC(fdatasync)
STAND_BEFORE(operationRename, -1, int, rename, (const char* from, const char* to), (from, to))
STAND_BEFORE(operationRemove, -1, int, unlink, (const char* path), (path))
STAND_BEFORE(operationRemove, -1, int, remove, (const char* path), (path))
STAND_BEFORE_CLOSING(close, (int file), (file))
STAND_BEFORE_CLOSING(fclose, (FILE * file), (file))
STAND_BEFORE(operationStatus, -1, int, stat, (const char* path, struct stat* status), (path, status))
STAND_BEFORE(operationStatus, -1, int, stat64, (const char* path, struct stat64* status), (path, status))
STAND_BEFORE(operationStatus, -1, int, fstat, (int file, struct stat* status), (file, status))
STAND_BEFORE(operationStatus, -1, int, fstat64, (int file, struct stat64* status), (file, status))
STAND_BEFORE(operationStatus, -1, int, access, (const char* path, int mode), (path, mode))
STAND_BEFORE(operationAttributes, -1, int, fchmod, (int file, mode_t mode), (file, mode))
STAND_BEFORE(operationAttributes, -1, int, fchown, (int file, uid_t owner, gid_t group), (file, owner, group))
STAND_BEFORE(operationResolve, NULL, char*, realpath, (const char* path, char* resolved), (path, resolved))
