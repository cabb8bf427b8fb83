/*
 * What every request carries: its context, where its results go, and errors that say more than a
 * status. Included by cmpift.h, which states what holds for all tables.
 */
#ifndef CMPI20_REQUEST_H
#define CMPI20_REQUEST_H

#include "../cmpidt.h"

#ifdef __cplusplus
extern "C" {
#endif

/** The circumstances of a request: named entries. Borrowed from the caller for one call. */
struct _CMPIContext {
    void* hdl;
    CMPIContextFT* ft;
};

struct _CMPIContextFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIContext* context);
    CMPIContext* (*clone)(const CMPIContext* context, CMPIStatus* rc);

    /** The entry of a name; CMPIPrincipal and its like in cmpidt.h are the usual ones. */
    CMPIData (*getEntry)(const CMPIContext* context, const char* name, CMPIStatus* rc);
    /** The entry at a position; `name`, unless null, receives its name. */
    CMPIData (*getEntryAt)(const CMPIContext* context, CMPICount index, CMPIString** name, CMPIStatus* rc);
    /** How many entries there are. */
    CMPICount (*getEntryCount)(const CMPIContext* context, CMPIStatus* rc);
    /** Adds an entry, or replaces the one of that name. */
    CMPIStatus (*addEntry)(const CMPIContext* context, const char* name, const CMPIValue* value, const CMPIType type);
};

/**
 * Where a provider puts what an operation answers, one element at a time. The broker takes over what
 * is returned: it must not be changed or released afterwards. Borrowed from the caller for one call.
 */
struct _CMPIResult {
    void* hdl;
    CMPIResultFT* ft;
};

struct _CMPIResultFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIResult* result);
    CMPIResult* (*clone)(const CMPIResult* result, CMPIStatus* rc);

    /** Returns a value: of a property, or what a method answers. */
    CMPIStatus (*returnData)(const CMPIResult* result, const CMPIValue* value, const CMPIType type);
    /** Returns an instance. */
    CMPIStatus (*returnInstance)(const CMPIResult* result, const CMPIInstance* instance);
    /** Returns an object path. */
    CMPIStatus (*returnObjectPath)(const CMPIResult* result, const CMPIObjectPath* path);
    /** Says that nothing more follows. */
    CMPIStatus (*returnDone)(const CMPIResult* result);
    /** Returns an error object; the operation's status still has to say that it failed. */
    CMPIStatus (*returnError)(const CMPIResult* result, const CMPIError* error);
};

/** An error as the CIM schema describes one. Texts that were never set are null. */
struct _CMPIError {
    void* hdl;
    CMPIErrorFT* ft;
};

struct _CMPIErrorFT {
    CMPISint32 ftVersion;
    CMPIStatus (*release)(CMPIError* error);
    CMPIError* (*clone)(const CMPIError* error, CMPIStatus* rc);

    /** @name Reading */
    ///@{
    CMPIErrorType (*getErrorType)(const CMPIError* error, CMPIStatus* rc);
    /** The type in words, when it is OtherErrorType. */
    CMPIString* (*getOtherErrorType)(const CMPIError* error, CMPIStatus* rc);
    /** Who defined the message id, such as an organisation. */
    CMPIString* (*getOwningEntity)(const CMPIError* error, CMPIStatus* rc);
    CMPIString* (*getMessageID)(const CMPIError* error, CMPIStatus* rc);
    CMPIString* (*getMessage)(const CMPIError* error, CMPIStatus* rc);
    CMPIErrorSeverity (*getPerceivedSeverity)(const CMPIError* error, CMPIStatus* rc);
    CMPIErrorProbableCause (*getProbableCause)(const CMPIError* error, CMPIStatus* rc);
    CMPIString* (*getProbableCauseDescription)(const CMPIError* error, CMPIStatus* rc);
    /** What can be done about it: an array of strings. */
    CMPIArray* (*getRecommendedActions)(const CMPIError* error, CMPIStatus* rc);
    /** Which object reports it, written in the source format. */
    CMPIString* (*getErrorSource)(const CMPIError* error, CMPIStatus* rc);
    CMPIErrorSrcFormat (*getErrorSourceFormat)(const CMPIError* error, CMPIStatus* rc);
    /** The source format in words, when it is CMPIErrSrcOther. */
    CMPIString* (*getOtherErrorSourceFormat)(const CMPIError* error, CMPIStatus* rc);
    CMPIrc (*getCIMStatusCode)(const CMPIError* error, CMPIStatus* rc);
    CMPIString* (*getCIMStatusCodeDescription)(const CMPIError* error, CMPIStatus* rc);
    /** What fills the place holders of the message: an array of strings. */
    CMPIArray* (*getMessageArguments)(const CMPIError* error, CMPIStatus* rc);
    ///@}

    /** @name Setting what its maker does not take */
    ///@{
    CMPIStatus (*setErrorType)(CMPIError* error, const CMPIErrorType type);
    CMPIStatus (*setOtherErrorType)(CMPIError* error, const char* type);
    CMPIStatus (*setProbableCauseDescription)(CMPIError* error, const char* description);
    CMPIStatus (*setRecommendedActions)(CMPIError* error, const CMPIArray* actions);
    CMPIStatus (*setErrorSource)(CMPIError* error, const char* source);
    CMPIStatus (*setErrorSourceFormat)(CMPIError* error, const CMPIErrorSrcFormat format);
    CMPIStatus (*setOtherErrorSourceFormat)(CMPIError* error, const char* format);
    CMPIStatus (*setCIMStatusCodeDescription)(CMPIError* error, const char* description);
    CMPIStatus (*setMessageArguments)(CMPIError* error, CMPIArray* arguments);
    ///@}
};

#ifdef __cplusplus
}
#endif

#endif
