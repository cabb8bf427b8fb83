/*
 * Objects of every request: context, result and detailed errors. Included by cmpift.h, which documents the rules for
 * all tables.
 */
#ifndef CMPI20_REQUEST_H
#define CMPI20_REQUEST_H

#include "../cmpidt.h"

#ifdef __cplusplus
extern "C" {
#endif

/** The context of a request: named entries. Borrowed from the caller for one call. */
struct _CMPIContext {
    void* hdl;
    CMPIContextFT* ft;
};

struct _CMPIContextFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIContext* context);
    CMPIContext* (*clone)(const CMPIContext* context, CMPIStatus* rc);

    /** Returns the entry with the name. cmpidt.h defines the usual names, such as CMPIPrincipal. */
    CMPIData (*getEntry)(const CMPIContext* context, const char* name, CMPIStatus* rc);
    /** Returns the entry at an index; `name`, unless null, receives its name. */
    CMPIData (*getEntryAt)(const CMPIContext* context, CMPICount index, CMPIString** name, CMPIStatus* rc);
    /** Returns the number of entries. */
    CMPICount (*getEntryCount)(const CMPIContext* context, CMPIStatus* rc);
    /** Adds an entry, or replaces the value of an existing one. */
    CMPIStatus (*addEntry)(const CMPIContext* context, const char* name, const CMPIValue* value, const CMPIType type);
};

/**
 * Receives the results of an operation, one element per call. The broker takes ownership of returned objects: providers
 * must not change or release them afterwards. Borrowed from the caller for one call.
 */
struct _CMPIResult {
    void* hdl;
    CMPIResultFT* ft;
};

struct _CMPIResultFT {
    int ftVersion;
    CMPIStatus (*release)(CMPIResult* result);
    CMPIResult* (*clone)(const CMPIResult* result, CMPIStatus* rc);

    /** Returns the value of a property or the result of a method. */
    CMPIStatus (*returnData)(const CMPIResult* result, const CMPIValue* value, const CMPIType type);
    /** Returns an instance. */
    CMPIStatus (*returnInstance)(const CMPIResult* result, const CMPIInstance* instance);
    /** Returns an object path. */
    CMPIStatus (*returnObjectPath)(const CMPIResult* result, const CMPIObjectPath* path);
    /** Reports that all results were returned. */
    CMPIStatus (*returnDone)(const CMPIResult* result);
    /** Returns an error object. The operation must still return an error status. */
    CMPIStatus (*returnError)(const CMPIResult* result, const CMPIError* error);
};

/** An error as defined by the CIM schema. Strings that were never set are null. */
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
    /** Returns the description of the type if the type is OtherErrorType. */
    CMPIString* (*getOtherErrorType)(const CMPIError* error, CMPIStatus* rc);
    /** Returns the owner of the message id, such as an organisation. */
    CMPIString* (*getOwningEntity)(const CMPIError* error, CMPIStatus* rc);
    CMPIString* (*getMessageID)(const CMPIError* error, CMPIStatus* rc);
    CMPIString* (*getMessage)(const CMPIError* error, CMPIStatus* rc);
    CMPIErrorSeverity (*getPerceivedSeverity)(const CMPIError* error, CMPIStatus* rc);
    CMPIErrorProbableCause (*getProbableCause)(const CMPIError* error, CMPIStatus* rc);
    CMPIString* (*getProbableCauseDescription)(const CMPIError* error, CMPIStatus* rc);
    /** Returns the recommended actions, an array of strings. */
    CMPIArray* (*getRecommendedActions)(const CMPIError* error, CMPIStatus* rc);
    /** Returns the object that reports the error, in the source format. */
    CMPIString* (*getErrorSource)(const CMPIError* error, CMPIStatus* rc);
    CMPIErrorSrcFormat (*getErrorSourceFormat)(const CMPIError* error, CMPIStatus* rc);
    /** Returns the description of the source format if that is CMPIErrSrcOther. */
    CMPIString* (*getOtherErrorSourceFormat)(const CMPIError* error, CMPIStatus* rc);
    CMPIrc (*getCIMStatusCode)(const CMPIError* error, CMPIStatus* rc);
    CMPIString* (*getCIMStatusCodeDescription)(const CMPIError* error, CMPIStatus* rc);
    /** Returns the values of the message's placeholders, an array of strings. */
    CMPIArray* (*getMessageArguments)(const CMPIError* error, CMPIStatus* rc);
    ///@}

    /** @name Setting attributes that newCMPIError does not set */
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
