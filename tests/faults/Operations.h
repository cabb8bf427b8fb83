#pragma once

/*
 * Operations of the system that a small library, linked before all others, stands in front of. It defines them under
 * their own names, so that the calls of the libraries under test come through it, whoever loads them and whenever.
 */

#ifdef __cplusplus
extern "C" {
#endif

/** What can fail; several functions of the system are one kind. */
enum OperationKind {
    operationAllocate,   /**< operator new, which is not of the system: Faults.cpp replaces it */
    operationTakeMemory, /**< malloc, calloc, realloc, but for operator new; with sanitizers, none is seen */
    operationOpen,       /**< open, openat, mkostemp, fopen, fdopen, mkdir, socket */
    operationRead,       /**< read */
    operationWrite,      /**< write, writev, fwrite, fflush, sendto */
    operationSeek,       /**< lseek */
    operationSync,       /**< fsync */
    operationRename,     /**< rename */
    operationRemove,     /**< unlink, remove */
    operationClose,      /**< close, fclose: what is open is closed all the same */
    operationStatus,     /**< stat, fstat, statvfs, access */
    operationAttributes, /**< fchmod, fchown */
    operationResolve,    /**< realpath */
    operationKinds
};

/** What becomes of an operation. */
struct OperationVerdict {
    int error;  /**< it fails with this errno value; 0: it is done */
    int partly; /**< it is done for half of what it was asked for: read, write, writev, fwrite */
};

/** Judges every operation, on the thread that is about to do it. */
typedef struct OperationVerdict (*OperationJudge)(enum OperationKind kind);

/** From now on; null, as at the start: every operation is done. */
__attribute__((visibility("default"))) void setOperationJudge(OperationJudge judge);

/** Is told, on the thread that is about to make it, of each file that is made unless it is there. */
typedef void (*CreationWitness)(const char* path);

/**
 * From now on; null, as at the start: nobody is told. As long as there is one, the first name that a temporary file is
 * tried to be given can be foreseen, so that the witness may be there first.
 */
__attribute__((visibility("default"))) void setCreationWitness(CreationWitness witness);

/**
 * Whatever path begins with this is not there, from now on: no test may look at the machine's own files.
 * @param beginning stays the caller's, and has to stay as it is
 */
__attribute__((visibility("default"))) void setAbsentDirectory(const char* beginning);

#ifdef __cplusplus
}
#endif
