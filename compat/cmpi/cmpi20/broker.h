/*
 * The broker: functions of the object manager that providers call. Included by cmpift.h, which documents the rules for
 * all tables.
 */
#ifndef CMPI20_BROKER_H
#define CMPI20_BROKER_H

#include <stddef.h>
#include <time.h>

#include "../cmpidt.h"

#ifdef __cplusplus
extern "C" {
#endif

/* time.h does not declare it in strict C99 mode. */
struct timespec;

/** The object manager. It outlives its providers, which keep only this pointer. */
struct _CMPIBroker {
    void* hdl;
    CMPIBrokerFT* bft;    /**< services: threads of a request, indications, operations on other classes */
    CMPIBrokerEncFT* eft; /**< functions that create and examine encapsulated objects */
    CMPIBrokerExtFT* xft; /**< threads, mutexes and conditions of the operating system; may be null */
    CMPIBrokerMemFT* mft; /**< memory; may be null */
};

/**
 * Services of the broker. The operations on instances and associations are those of a CIM client. The broker calls the
 * provider that serves the class, possibly the caller itself and possibly on another thread, so callers must not hold a
 * lock.
 */
struct _CMPIBrokerFT {
    unsigned int brokerCapabilities; /**< CMPI_MB_ bits */
    unsigned int brokerVersion;      /**< CMPI version of the broker */
    const char* brokerName;

    /** @name Threads that a provider starts */
    ///@{

    /**
     * Creates a context for a new thread. The starting thread calls this and the new thread passes the context to
     * attachThread.
     */
    CMPIContext* (*prepareAttachThread)(const CMPIBroker* broker, const CMPIContext* context);
    /** Registers the calling thread with the broker, so that the thread can call the broker. */
    CMPIStatus (*attachThread)(const CMPIBroker* broker, const CMPIContext* context);
    /** Reverses attachThread and releases the thread's context. */
    CMPIStatus (*detachThread)(const CMPIBroker* broker, const CMPIContext* context);
    ///@}

    /** Delivers an indication to all its subscribers in the namespace. */
    CMPIStatus (*deliverIndication)(const CMPIBroker* broker, const CMPIContext* context, const char* nameSpace,
                                    const CMPIInstance* indication);

    /** @name Operations on instances */
    ///@{

    /** Returns the object paths of the instances of a class, given by a path without keys. */
    CMPIEnumeration* (*enumerateInstanceNames)(const CMPIBroker* broker, const CMPIContext* context,
                                               const CMPIObjectPath* classPath, CMPIStatus* rc);
    /** Returns the instance with the path. */
    CMPIInstance* (*getInstance)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                 const char** properties, CMPIStatus* rc);
    /** Creates an instance and returns its path. */
    CMPIObjectPath* (*createInstance)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                      const CMPIInstance* instance, CMPIStatus* rc);
    /**
     * Sets the listed properties of an instance to those of another. A listed property that the other lacks becomes
     * null.
     */
    CMPIStatus (*modifyInstance)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                 const CMPIInstance* instance, const char** properties);
    /** Deletes an instance. */
    CMPIStatus (*deleteInstance)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path);
    /** Returns the instances of the path's class that a query selects. */
    CMPIEnumeration* (*execQuery)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* classPath,
                                  const char* query, const char* language, CMPIStatus* rc);
    /** Returns the instances of a class. */
    CMPIEnumeration* (*enumerateInstances)(const CMPIBroker* broker, const CMPIContext* context,
                                           const CMPIObjectPath* classPath, const char** properties, CMPIStatus* rc);
    ///@}

    /** @name Operations on associations
     * The path is the source. assocClass restricts the association class, resultClass the class of the targets, role
     * the source's property in the association, and resultRole the target's property.
     */
    ///@{

    /** Returns the associated instances. */
    CMPIEnumeration* (*associators)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                    const char* assocClass, const char* resultClass, const char* role,
                                    const char* resultRole, const char** properties, CMPIStatus* rc);
    /** Returns the object paths of the associated instances. */
    CMPIEnumeration* (*associatorNames)(const CMPIBroker* broker, const CMPIContext* context,
                                        const CMPIObjectPath* path, const char* assocClass, const char* resultClass,
                                        const char* role, const char* resultRole, CMPIStatus* rc);
    /** Returns the association instances; resultClass is their class. */
    CMPIEnumeration* (*references)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                   const char* resultClass, const char* role, const char** properties, CMPIStatus* rc);
    /** Returns the object paths of the association instances. */
    CMPIEnumeration* (*referenceNames)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                       const char* resultClass, const char* role, CMPIStatus* rc);
    ///@}

    /** @name Methods and single properties */
    ///@{

    /** Calls a method of an instance or, with a path without keys, of a class. Writes the output arguments to `out`. */
    CMPIData (*invokeMethod)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                             const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* rc);
    /** Sets a property of an instance. A null value sets the property to null. */
    CMPIStatus (*setProperty)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                              const char* name, const CMPIValue* value, CMPIType type);
    /** Returns a property of an instance. */
    CMPIData (*getProperty)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                            const char* name, CMPIStatus* rc);
    ///@}
};

/** Functions that create encapsulated objects or return information about them. */
struct _CMPIBrokerEncFT {
    int ftVersion;

    /** @name Creating objects */
    ///@{

    /** Creates an instance of the path's class with that path. */
    CMPIInstance* (*newInstance)(const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* rc);
    /** Creates a path of a class, without keys. */
    CMPIObjectPath* (*newObjectPath)(const CMPIBroker* broker, const char* nameSpace, const char* className,
                                     CMPIStatus* rc);
    /** Creates an empty list of method arguments. */
    CMPIArgs* (*newArgs)(const CMPIBroker* broker, CMPIStatus* rc);
    /** Creates a string. Null creates a string without characters. */
    CMPIString* (*newString)(const CMPIBroker* broker, const char* text, CMPIStatus* rc);
    /** Creates an array of `size` null elements; `type` is the type of an element. */
    CMPIArray* (*newArray)(const CMPIBroker* broker, CMPICount size, CMPIType type, CMPIStatus* rc);
    /** Returns the current time. */
    CMPIDateTime* (*newDateTime)(const CMPIBroker* broker, CMPIStatus* rc);
    /** Creates a datetime from microseconds since 1970-01-01 UTC, or an interval from microseconds. */
    CMPIDateTime* (*newDateTimeFromBinary)(const CMPIBroker* broker, CMPIUint64 microseconds, CMPIBoolean interval,
                                           CMPIStatus* rc);
    /** Creates a datetime or interval from its 25-character CIM string. */
    CMPIDateTime* (*newDateTimeFromChars)(const CMPIBroker* broker, const char* text, CMPIStatus* rc);
    /** Parses a query; `projection`, unless null, receives the selected names. */
    CMPISelectExp* (*newSelectExp)(const CMPIBroker* broker, const char* query, const char* language,
                                   CMPIArray** projection, CMPIStatus* rc);
    ///@}

    /** @name Information about objects
     * The object may be any encapsulated object: the broker identifies its type by its function table.
     */
    ///@{

    /** Returns whether a path's class is the class or one of its subclasses. */
    CMPIBoolean (*classPathIsA)(const CMPIBroker* broker, const CMPIObjectPath* path, const char* className,
                                CMPIStatus* rc);
    /** Returns a human-readable description of an object in a format of the broker. */
    CMPIString* (*toString)(const CMPIBroker* broker, const void* object, CMPIStatus* rc);
    /** Returns whether an object has the interface type with that name, such as "CMPIInstance". */
    CMPIBoolean (*isOfType)(const CMPIBroker* broker, const void* object, const char* type, CMPIStatus* rc);
    /** Returns the name of an object's interface type. */
    CMPIString* (*getType)(const CMPIBroker* broker, const void* object, CMPIStatus* rc);
    ///@}

    /** @name Messages */
    ///@{

    /**
     * Returns a message in the client's language with its placeholders replaced.
     * @param count number of arguments that follow, each a CMPIType and a value of that type
     */
    CMPIString* (*getMessage)(const CMPIBroker* broker, const char* id, const char* defaultText, CMPIStatus* rc,
                              CMPICount count, ...);
    /** Writes `text` to the broker's log or, if `text` is null, `string`. */
    CMPIStatus (*logMessage)(const CMPIBroker* broker, int severity, const char* id, const char* text,
                             const CMPIString* string);
    /** Writes to the broker's trace. Otherwise like logMessage. */
    CMPIStatus (*trace)(const CMPIBroker* broker, int level, const char* component, const char* text,
                        const CMPIString* string);
    ///@}

    /** @name Since CMPI 2.0 */
    ///@{

    /** Creates an error object for CMPIResultFT's returnError. */
    CMPIError* (*newCMPIError)(const CMPIBroker* broker, const char* owningEntity, const char* messageId,
                               const char* message, const CMPIErrorSeverity severity,
                               const CMPIErrorProbableCause probableCause, const CMPIrc statusCode, CMPIStatus* rc);
    /** Opens a message catalogue. The caller must close it. */
    CMPIStatus (*openMessageFile)(const CMPIBroker* broker, const char* name, CMPIMsgFileHandle* file);
    /** Closes a message catalogue. */
    CMPIStatus (*closeMessageFile)(const CMPIBroker* broker, const CMPIMsgFileHandle file);
    /** Like getMessage, with a message from an open message catalogue. */
    CMPIString* (*getMessage2)(const CMPIBroker* broker, const char* id, const CMPIMsgFileHandle file,
                               const char* defaultText, CMPIStatus* rc, CMPICount count, ...);
    ///@}
};

/**
 * Portable functions for threads of the operating system. A function that returns int returns 0 or an error number. A
 * function that creates something returns null on failure. The caller owns the created objects and must destroy them.
 */
struct _CMPIBrokerExtFT {
    int ftVersion;

    /** Returns the platform's file name of the library. The caller must free it. */
    char* (*resolveFileName)(const char* libraryName);

    /** @name Threads */
    ///@{

    /** Starts a thread. A detached thread cannot be joined. */
    void* (*newThread)(void* (*start)(void*), void* argument, int detached);
    /** Waits for a thread; `result`, unless null, receives the thread's result. */
    int (*joinThread)(void* thread, void** result);
    /** Ends the calling thread. */
    int (*exitThread)(void* result);
    /** Requests the cancellation of a thread. */
    int (*cancelThread)(void* thread);
    /** Suspends the calling thread. */
    int (*threadSleep)(CMPIUint32 milliseconds);
    /** Calls `function` on the first call for this `once`, whose initial value is 0. */
    int (*threadOnce)(int* once, void (*function)(void));
    ///@}

    /** @name Thread-specific values */
    ///@{

    /** Creates a key. When a thread ends, `cleanup`, unless null, is called with its value. */
    int (*createThreadKey)(unsigned long* key, void (*cleanup)(void*));
    /** Destroys a key without calling `cleanup`. */
    int (*destroyThreadKey)(unsigned long key);
    /** Returns the calling thread's value of a key; null if it has none. */
    void* (*getThreadSpecific)(unsigned long key);
    /** Sets the calling thread's value of a key. */
    int (*setThreadSpecific)(unsigned long key, void* value);
    ///@}

    /** @name Mutexes and conditions */
    ///@{
    void* (*newMutex)(int options);
    void (*destroyMutex)(void* mutex);
    void (*lockMutex)(void* mutex);
    void (*unlockMutex)(void* mutex);
    void* (*newCondition)(int options);
    void (*destroyCondition)(void* condition);
    /** Waits for a condition and releases the caller's mutex while waiting. */
    int (*condWait)(void* condition, void* mutex);
    /** Like condWait, with a timeout. */
    int (*timedCondWait)(void* condition, void* mutex, struct timespec* until);
    /** Wakes a thread that waits for the condition. */
    int (*signalCondition)(void* condition);
    ///@}
};

/** Memory of the broker, and release of single objects before the request ends. */
struct _CMPIBrokerMemFT {
    const int ftVersion;

    /** @name Marks
     * For a thread that creates many objects in one request.
     */
    ///@{

    /** Returns a mark for the objects that the thread has created so far. */
    CMPIGcStat* (*mark)(const CMPIBroker* broker, CMPIStatus* rc);
    /** Releases the objects that the thread has created since a mark. */
    CMPIStatus (*release)(const CMPIBroker* broker, const CMPIGcStat* mark);
    ///@}

    /** @name Allocation
     * Like the C functions of these names, but the broker frees the memory at the end of the request if it was not
     * freed before. Null if out of memory.
     */
    ///@{
    void* (*cmpiMalloc)(const CMPIBroker* broker, size_t size);
    void* (*cmpiCalloc)(const CMPIBroker* broker, size_t count, size_t size);
    void* (*cmpiRealloc)(const CMPIBroker* broker, void* memory, size_t size);
    char* (*cmpiStrDup)(const CMPIBroker* broker, const char* text);
    void (*cmpiFree)(const CMPIBroker* broker, void* memory);
    ///@}

    /** @name Release of objects that functions of CMPIBrokerEncFT created */
    ///@{
    void (*freeInstance)(const CMPIBroker* broker, CMPIInstance* instance);
    void (*freeObjectPath)(const CMPIBroker* broker, CMPIObjectPath* path);
    void (*freeArgs)(const CMPIBroker* broker, CMPIArgs* args);
    void (*freeString)(const CMPIBroker* broker, CMPIString* string);
    void (*freeArray)(const CMPIBroker* broker, CMPIArray* array);
    void (*freeDateTime)(const CMPIBroker* broker, CMPIDateTime* dateTime);
    void (*freeSelectExp)(const CMPIBroker* broker, CMPISelectExp* expression);
    ///@}
};

#ifdef __cplusplus
}
#endif

#endif
