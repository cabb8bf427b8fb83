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

static OperationJudge currentJudge;
static CreationWitness currentWitness;
static const char* absentDirectory;

void setOperationJudge(OperationJudge judge) {
    __atomic_store_n(&currentJudge, judge, __ATOMIC_SEQ_CST);
}

void setCreationWitness(CreationWitness witness) {
    __atomic_store_n(&currentWitness, witness, __ATOMIC_SEQ_CST);
}

void setAbsentDirectory(const char* beginning) {
    __atomic_store_n(&absentDirectory, beginning, __ATOMIC_SEQ_CST);
}

static struct OperationVerdict verdictOn(enum OperationKind kind) {
    const struct OperationVerdict done = {0, 0};
    const OperationJudge judge = __atomic_load_n(&currentJudge, __ATOMIC_SEQ_CST);
    return judge == NULL ? done : judge(kind);
}

static struct OperationVerdict verdictOnPath(enum OperationKind kind, const char* path) {
    struct OperationVerdict verdict = verdictOn(kind);
    const char* absent = __atomic_load_n(&absentDirectory, __ATOMIC_SEQ_CST);
    if (verdict.error == 0 && absent != NULL && strncmp(path, absent, strlen(absent)) == 0) {
        verdict.error = ENOENT;
    }
    return verdict;
}

static void tellOfCreation(const char* path) {
    const CreationWitness witness = __atomic_load_n(&currentWitness, __ATOMIC_SEQ_CST);
    if (witness != NULL) {
        witness(path);
    }
}

/** The function of that name behind this library. */
#define NEXT(name) (__extension__(__typeof__(&name)) dlsym(RTLD_NEXT, #name))

/** A function that fails as a whole or is passed on. */
#define STAND_WITH(judgement, failed, result, name, parameters, arguments) \
    VISIBLE result name parameters {                                       \
        const struct OperationVerdict verdict = judgement;                 \
        if (verdict.error != 0) {                                          \
            errno = verdict.error;                                         \
            return failed;                                                 \
        }                                                                  \
        return NEXT(name) arguments;                                       \
    }
#define STAND_BEFORE(kind, failed, result, name, parameters, arguments) \
    STAND_WITH(verdictOn(kind), failed, result, name, parameters, arguments)
#define STAND_BEFORE_PATH(kind, failed, result, name, parameters, arguments) \
    STAND_WITH(verdictOnPath(kind, path), failed, result, name, parameters, arguments)

/** One that closes: a failure is told after it. */
#define STAND_BEFORE_CLOSING(name, parameters, arguments)                  \
    VISIBLE int name parameters {                                          \
        const struct OperationVerdict verdict = verdictOn(operationClose); \
        const int result = NEXT(name) arguments;                           \
        if (verdict.error != 0) {                                          \
            errno = verdict.error;                                         \
        }                                                                  \
        return verdict.error != 0 ? -1 : result;                           \
    }

/** One whose last parameter, the mode of a new file, is there only if the flags ask for one. */
#define STAND_BEFORE_OPENING(name, parameters, first)                               \
    VISIBLE int name parameters {                                                   \
        mode_t mode = 0;                                                            \
        if ((flags & (O_CREAT | __O_TMPFILE)) != 0) {                               \
            va_list rest;                                                           \
            va_start(rest, flags);                                                  \
            mode = va_arg(rest, mode_t);                                            \
            va_end(rest);                                                           \
        }                                                                           \
        const struct OperationVerdict verdict = verdictOnPath(operationOpen, path); \
        if (verdict.error != 0) {                                                   \
            errno = verdict.error;                                                  \
            return -1;                                                              \
        }                                                                           \
        if ((flags & O_CREAT) != 0) {                                               \
            tellOfCreation(path);                                                   \
        }                                                                           \
        return NEXT(name)(first, flags, mode);                                      \
    }

/** One that may be done in part. */
#define STAND_BEFORE_TRANSFER(kind, failed, result, name, parameters, amount, arguments) \
    VISIBLE result name parameters {                                                     \
        const struct OperationVerdict verdict = verdictOn(kind);                         \
        if (verdict.error != 0) {                                                        \
            errno = verdict.error;                                                       \
            return failed;                                                               \
        }                                                                                \
        if (verdict.partly && amount > 1) {                                              \
            amount /= 2;                                                                 \
        }                                                                                \
        return NEXT(name) arguments;                                                     \
    }

/** One that opens by a mode in letters. */
#define STAND_BEFORE_STREAM(name)                                                   \
    VISIBLE FILE* name(const char* path, const char* mode) {                        \
        const struct OperationVerdict verdict = verdictOnPath(operationOpen, path); \
        if (verdict.error != 0) {                                                   \
            errno = verdict.error;                                                  \
            return NULL;                                                            \
        }                                                                           \
        if (mode[0] != 'r') {                                                       \
            tellOfCreation(path);                                                   \
        }                                                                           \
        return NEXT(name)(path, mode);                                              \
    }

/** One that makes a temporary file. While somebody is told of it, its first name is no secret. */
#define STAND_BEFORE_TEMPORARY(name)                                                   \
    VISIBLE int name(char* pattern, int flags) {                                       \
        const struct OperationVerdict verdict = verdictOnPath(operationOpen, pattern); \
        if (verdict.error != 0) {                                                      \
            errno = verdict.error;                                                     \
            return -1;                                                                 \
        }                                                                              \
        const int file = foreseenTemporary(pattern, flags);                            \
        return file >= 0 ? file : NEXT(name)(pattern, flags);                          \
    }

/** As mkostemp would make it, had it come upon this name first; negative when that name is taken. */
static int foreseenTemporary(char* pattern, int flags) {
    const size_t length = strlen(pattern);
    if (__atomic_load_n(&currentWitness, __ATOMIC_SEQ_CST) == NULL || length < 6) {
        return -1;
    }
    char* const varying = pattern + length - 6;
    memcpy(varying, "abcdef", 6);
    tellOfCreation(pattern);
    const int file = NEXT(open)(pattern, O_RDWR | O_CREAT | O_EXCL | flags, 0600);
    if (file < 0) {
        memcpy(varying, "XXXXXX", 6);
    }
    return file;
}

/** One that takes memory; found once, since looking for a function may take some itself. */
#define STAND_BEFORE_MEMORY(name, parameters, arguments)                        \
    VISIBLE void* name parameters {                                             \
        static __typeof__(&name) next;                                          \
        const struct OperationVerdict verdict = verdictOn(operationTakeMemory); \
        if (verdict.error != 0) {                                               \
            errno = verdict.error;                                              \
            return NULL;                                                        \
        }                                                                       \
        if (__atomic_load_n(&next, __ATOMIC_RELAXED) == NULL) {                 \
            __atomic_store_n(&next, NEXT(name), __ATOMIC_RELAXED);              \
        }                                                                       \
        return __atomic_load_n(&next, __ATOMIC_RELAXED) arguments;              \
    }

/** Nothing is forced to the disk: no test looks at it after a loss of power, and each would wait for it. */
#define STAND_FOR_SYNC(name)                                              \
    VISIBLE int name(int file) {                                          \
        const struct OperationVerdict verdict = verdictOn(operationSync); \
        (void)file;                                                       \
        errno = verdict.error != 0 ? verdict.error : errno;               \
        return verdict.error != 0 ? -1 : 0;                               \
    }

#ifndef LAW_SANITIZE
STAND_BEFORE_MEMORY(malloc, (size_t size), (size))
STAND_BEFORE_MEMORY(calloc, (size_t count, size_t size), (count, size))
STAND_BEFORE_MEMORY(realloc, (void* memory, size_t size), (memory, size))
#endif

#define BOTH(first, second) first, second

STAND_BEFORE_OPENING(open, (const char* path, int flags, ...), path)
STAND_BEFORE_OPENING(open64, (const char* path, int flags, ...), path)
STAND_BEFORE_OPENING(openat, (int directory, const char* path, int flags, ...), BOTH(directory, path))
STAND_BEFORE_OPENING(openat64, (int directory, const char* path, int flags, ...), BOTH(directory, path))
STAND_BEFORE_TEMPORARY(mkostemp)
STAND_BEFORE_TEMPORARY(mkostemp64)
STAND_BEFORE_STREAM(fopen)
STAND_BEFORE_STREAM(fopen64)
STAND_BEFORE(operationOpen, NULL, FILE*, fdopen, (int file, const char* mode), (file, mode))
STAND_BEFORE(operationOpen, -1, int, socket, (int domain, int type, int protocol), (domain, type, protocol))
STAND_BEFORE_PATH(operationOpen, -1, int, mkdir, (const char* path, mode_t mode), (path, mode))

STAND_BEFORE_TRANSFER(operationRead, -1, ssize_t, read, (int file, void* data, size_t size), size, (file, data, size))
STAND_BEFORE_TRANSFER(operationWrite, -1, ssize_t, write, (int file, const void* data, size_t size), size,
                      (file, data, size))
STAND_BEFORE_TRANSFER(operationWrite, -1, ssize_t, writev, (int file, const struct iovec* parts, int count), count,
                      (file, parts, count))
STAND_BEFORE_TRANSFER(operationWrite, 0, size_t, fwrite, (const void* data, size_t size, size_t count, FILE* file),
                      count, (data, size, count, file))
STAND_BEFORE(operationWrite, -1, ssize_t, sendto,
             (int file, const void* data, size_t size, int flags, __CONST_SOCKADDR_ARG address, socklen_t length),
             (file, data, size, flags, address, length))
STAND_BEFORE(operationWrite, EOF, int, fflush, (FILE * file), (file))
STAND_BEFORE(operationSeek, -1, off_t, lseek, (int file, off_t offset, int whence), (file, offset, whence))
STAND_BEFORE(operationSeek, -1, off64_t, lseek64, (int file, off64_t offset, int whence), (file, offset, whence))
STAND_FOR_SYNC(fsync)
STAND_BEFORE(operationRename, -1, int, rename, (const char* from, const char* to), (from, to))
STAND_BEFORE(operationRemove, -1, int, unlink, (const char* path), (path))
STAND_BEFORE(operationRemove, -1, int, remove, (const char* path), (path))
STAND_BEFORE_CLOSING(close, (int file), (file))
STAND_BEFORE_CLOSING(fclose, (FILE * file), (file))
STAND_BEFORE_PATH(operationStatus, -1, int, stat, (const char* path, struct stat* status), (path, status))
STAND_BEFORE_PATH(operationStatus, -1, int, stat64, (const char* path, struct stat64* status), (path, status))
STAND_BEFORE(operationStatus, -1, int, fstat, (int file, struct stat* status), (file, status))
STAND_BEFORE(operationStatus, -1, int, fstat64, (int file, struct stat64* status), (file, status))
STAND_BEFORE_PATH(operationStatus, -1, int, statvfs, (const char* path, struct statvfs* status), (path, status))
STAND_BEFORE_PATH(operationStatus, -1, int, access, (const char* path, int mode), (path, mode))
STAND_BEFORE(operationAttributes, -1, int, fchmod, (int file, mode_t mode), (file, mode))
STAND_BEFORE(operationAttributes, -1, int, fchown, (int file, uid_t owner, gid_t group), (file, owner, group))
STAND_BEFORE_PATH(operationResolve, NULL, char*, realpath, (const char* path, char* resolved), (path, resolved))
