#pragma once

/*
 * Interposes functions of the C library. This library defines functions of the same names and must be linked before all
 * others, so that the libraries under test call its functions.
 */

#ifdef __cplusplus
extern "C" {
#endif

/** Operations that can fail. A kind comprises several functions. */
enum OperationKind {
    operationAllocate,   /**< operator new, which Faults.cpp replaces */
    operationTakeMemory, /**< malloc, calloc, realloc, except in operator new; not counted with sanitizers */
    operationOpen,       /**< open, openat, mkostemp, fopen, fdopen, mkdir, socket */
    operationRead,       /**< read */
    operationWrite,      /**< write, writev, fwrite, fflush, sendto, truncate, ftruncate */
    operationSeek,       /**< lseek */
    operationSync,       /**< fsync */
    operationRename,     /**< rename */
    operationRemove,     /**< unlink, remove */
    operationClose,      /**< close, fclose; close the file even if they fail */
    operationStatus,     /**< stat, fstat, statvfs, access */
    operationAttributes, /**< fchmod, fchown */
    operationResolve,    /**< realpath */
    operationLock,       /**< fcntl */
    operationKinds
};

/** Failure of an operation. */
struct OperationFailure {
    int error;  /**< errno value of the failure; 0 for success */
    int partly; /**< complete only half of the operation: read, write, writev, fwrite */
};

/** Called before every operation, on its thread. Returns how the operation fails. */
typedef struct OperationFailure (*OperationHook)(enum OperationKind kind);

/** Sets the hook. With null, the initial value, every operation succeeds. */
__attribute__((visibility("default"))) void setOperationHook(OperationHook hook);

/** Called before a file is created, on the creating thread. */
typedef void (*CreationObserver)(const char* path);

/**
 * Sets the observer; null, the initial value, for none. While an observer is set, the first name of a temporary file is
 * predictable, so that the observer can create the file first.
 */
__attribute__((visibility("default"))) void setCreationObserver(CreationObserver observer);

/**
 * Makes all paths with this prefix nonexistent, so that tests cannot access files of the host.
 * @param beginning borrowed; must stay unchanged
 */
__attribute__((visibility("default"))) void setAbsentDirectory(const char* beginning);

#ifdef __cplusplus
}
#endif
