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
    operationOpen,       /**< open, openat, mkostemp, fopen */
    operationRead,       /**< read */
    operationWrite,      /**< write, writev, fwrite, fflush */
    operationSync,       /**< fsync, fdatasync */
    operationRename,     /**< rename */
    operationRemove,     /**< unlink, remove */
    operationClose,      /**< close, fclose: what is open is closed all the same */
    operationStatus,     /**< stat, fstat, access */
    operationAttributes, /**< fchmod, fchown */
    operationResolve,    /**< realpath */
    operationKinds
};

/** What becomes of an operation. */
struct OperationVerdict {
    int error;  /**< it fails with this errno value; 0: it is done */
    int partly; /**< it is done for half of what it was asked for: read, write, writev */
};

/** Judges every operation, on the thread that is about to do it. */
typedef struct OperationVerdict (*OperationJudge)(enum OperationKind kind);

/** From now on; null, as at the start: every operation is done. */
__attribute__((visibility("default"))) void setOperationJudge(OperationJudge judge);

#ifdef __cplusplus
}
#endif
