/*
 * The broker: what an object manager offers its providers. Included by cmpift.h, which states what
 * holds for all tables.
 */
#ifndef CMPI20_BROKER_H
#define CMPI20_BROKER_H

#include "../cmpidt.h"

#include <stddef.h>
#include <time.h>

#ifdef __cplusplus
extern "C" {
#endif

/* Strict C99 leaves it out of time.h. */
struct timespec;

/** The object manager. It outlives the providers that it loads; they keep the pointer, nothing else. */
struct _CMPIBroker {
    void* hdl;
    CMPIBrokerFT* bft;    /**< services: threads of a request, indications, operations on other classes */
    CMPIBrokerEncFT* eft; /**< makers and helpers of encapsulated objects */
    CMPIBrokerExtFT* xft; /**< threads, mutexes and conditions of the operating system; may be null */
    CMPIBrokerMemFT* mft; /**< memory; may be null */
};

/**
 * Services of the broker. The operations on instances and associations are those of a CIM client;
 * the broker routes them to the provider that serves the class, which may be the caller itself and
 * may run on another thread: no lock may be held across them.
 */
struct _CMPIBrokerFT {
    unsigned int brokerCapabilities; /**< CMPI_MB_ bits */
    unsigned int brokerVersion;      /**< the CMPI version it offers */
    const char* brokerName;

    /** @name Threads that a provider starts itself */
    ///@{

    /** A context for a new thread, made by the thread that starts it and passed to attachThread. */
    CMPIContext* (*prepareAttachThread)(const CMPIBroker* broker, const CMPIContext* context);
    /** Makes the calling thread known to the broker; it may call the broker from here on. */
    CMPIStatus (*attachThread)(const CMPIBroker* broker, const CMPIContext* context);
    /** Ends what attachThread began, and the life of the thread's context. */
    CMPIStatus (*detachThread)(const CMPIBroker* broker, const CMPIContext* context);
    ///@}

    /** Hands an indication to everybody who subscribed to it in the namespace. */
    CMPIStatus (*deliverIndication)(const CMPIBroker* broker, const CMPIContext* context, const char* nameSpace,
                                    const CMPIInstance* indication);

    /** @name Operations on instances */
    ///@{

    /** The object paths of the instances of a class, given by a path without keys. */
    CMPIEnumeration* (*enumerateInstanceNames)(const CMPIBroker* broker, const CMPIContext* context,
                                               const CMPIObjectPath* classPath, CMPIStatus* rc);
    /** The instance that a path names. */
    CMPIInstance* (*getInstance)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                 const char** properties, CMPIStatus* rc);
    /** Creates an instance; answers the path by which it was created. */
    CMPIObjectPath* (*createInstance)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                      const CMPIInstance* instance, CMPIStatus* rc);
    /** Sets the listed properties of an instance to those of another; a listed one that is not there becomes null. */
    CMPIStatus (*modifyInstance)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                 const CMPIInstance* instance, const char** properties);
    /** Deletes an instance. */
    CMPIStatus (*deleteInstance)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path);
    /** The instances that a query in a language selects, among those of the path's class. */
    CMPIEnumeration* (*execQuery)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* classPath,
                                  const char* query, const char* language, CMPIStatus* rc);
    /** The instances of a class. */
    CMPIEnumeration* (*enumerateInstances)(const CMPIBroker* broker, const CMPIContext* context,
                                           const CMPIObjectPath* classPath, const char** properties, CMPIStatus* rc);
    ///@}

    /** @name Operations on associations
     * The path is where they start. assocClass restricts the association, resultClass the far end;
     * role is the near end's property in the association, resultRole the far end's.
     */
    ///@{

    /** The instances at the far ends. */
    CMPIEnumeration* (*associators)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                    const char* assocClass, const char* resultClass, const char* role,
                                    const char* resultRole, const char** properties, CMPIStatus* rc);
    /** The object paths of the far ends. */
    CMPIEnumeration* (*associatorNames)(const CMPIBroker* broker, const CMPIContext* context,
                                        const CMPIObjectPath* path, const char* assocClass, const char* resultClass,
                                        const char* role, const char* resultRole, CMPIStatus* rc);
    /** The association instances themselves; resultClass is their class. */
    CMPIEnumeration* (*references)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                   const char* resultClass, const char* role, const char** properties, CMPIStatus* rc);
    /** The object paths of the association instances. */
    CMPIEnumeration* (*referenceNames)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                                       const char* resultClass, const char* role, CMPIStatus* rc);
    ///@}

    /** @name Methods and single properties */
    ///@{

    /** Invokes a method of an instance or, on a path without keys, of a class; fills `out`. */
    CMPIData (*invokeMethod)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                             const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* rc);
    /** Sets one property of an instance; a null value makes it null. */
    CMPIStatus (*setProperty)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                              const char* name, const CMPIValue* value, CMPIType type);
    /** One property of an instance. */
    CMPIData (*getProperty)(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                            const char* name, CMPIStatus* rc);
    ///@}
};

/** Makers of encapsulated objects, and what can be asked about any of them. */
struct _CMPIBrokerEncFT {
    int ftVersion;

    /** @name Makers */
    ///@{

    /** An instance of a path's class, with that path. */
    CMPIInstance* (*newInstance)(const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* rc);
    /** A path of a class, without keys. */
    CMPIObjectPath* (*newObjectPath)(const CMPIBroker* broker, const char* nameSpace, const char* className,
                                     CMPIStatus* rc);
    /** An empty list of method arguments. */
    CMPIArgs* (*newArgs)(const CMPIBroker* broker, CMPIStatus* rc);
    /** A string; null text makes one whose characters are null. */
    CMPIString* (*newString)(const CMPIBroker* broker, const char* text, CMPIStatus* rc);
    /** An array of `size` null elements; `type` is the type of an element. */
    CMPIArray* (*newArray)(const CMPIBroker* broker, CMPICount size, CMPIType type, CMPIStatus* rc);
    /** The current time. */
    CMPIDateTime* (*newDateTime)(const CMPIBroker* broker, CMPIStatus* rc);
    /** Microseconds since 1970-01-01 UTC or, of an interval, microseconds. */
    CMPIDateTime* (*newDateTimeFromBinary)(const CMPIBroker* broker, CMPIUint64 microseconds, CMPIBoolean interval,
                                           CMPIStatus* rc);
    /** From the 25 characters of CIM's text form of a datetime or interval. */
    CMPIDateTime* (*newDateTimeFromChars)(const CMPIBroker* broker, const char* text, CMPIStatus* rc);
    /** A parsed query; `projection`, unless null, receives the names it selects. */
    CMPISelectExp* (*newSelectExp)(const CMPIBroker* broker, const char* query, const char* language,
                                   CMPIArray** projection, CMPIStatus* rc);
    ///@}

    /** @name Questions about objects
     * An object is any encapsulated one: the broker knows its kind by its function table.
     */
    ///@{

    /** Whether a path's class is a class or a subclass of it. */
    CMPIBoolean (*classPathIsA)(const CMPIBroker* broker, const CMPIObjectPath* path, const char* className,
                                CMPIStatus* rc);
    /** A text for people that shows what is in an object; its form is the broker's. */
    CMPIString* (*toString)(const CMPIBroker* broker, const void* object, CMPIStatus* rc);
    /** Whether an object is of the interface type of that name, such as "CMPIInstance". */
    CMPIBoolean (*isOfType)(const CMPIBroker* broker, const void* object, const char* type, CMPIStatus* rc);
    /** The name of an object's interface type. */
    CMPIString* (*getType)(const CMPIBroker* broker, const void* object, CMPIStatus* rc);
    ///@}

    /** @name Messages */
    ///@{

    /**
     * A message in the client's language, with its place holders filled.
     * @param count number of arguments that follow, each a CMPIType and a value of it
     */
    CMPIString* (*getMessage)(const CMPIBroker* broker, const char* id, const char* defaultText, CMPIStatus* rc,
                              CMPICount count, ...);
    /** Writes to the broker's log: `text` or, when that is null, `string`. */
    CMPIStatus (*logMessage)(const CMPIBroker* broker, int severity, const char* id, const char* text,
                             const CMPIString* string);
    /** Writes to the broker's trace, likewise. */
    CMPIStatus (*trace)(const CMPIBroker* broker, int level, const char* component, const char* text,
                        const CMPIString* string);
    ///@}

    /** @name Since CMPI 2.0 */
    ///@{

    /** An error object, for CMPIResultFT's returnError. */
    CMPIError* (*newCMPIError)(const CMPIBroker* broker, const char* owningEntity, const char* messageId,
                               const char* message, const CMPIErrorSeverity severity,
                               const CMPIErrorProbableCause probableCause, const CMPIrc statusCode, CMPIStatus* rc);
    /** Opens a message catalogue; the caller closes it. */
    CMPIStatus (*openMessageFile)(const CMPIBroker* broker, const char* name, CMPIMsgFileHandle* file);
    /** Closes a message catalogue. */
    CMPIStatus (*closeMessageFile)(const CMPIBroker* broker, const CMPIMsgFileHandle file);
    /** As getMessage, from an open message catalogue. */
    CMPIString* (*getMessage2)(const CMPIBroker* broker, const char* id, const CMPIMsgFileHandle file,
                               const char* defaultText, CMPIStatus* rc, CMPICount count, ...);
    ///@}
};

/**
 * The operating system's threads behind names that are the same everywhere. Functions that answer an
 * int answer 0 for success and an error number otherwise, those that make something null when they
 * cannot. What is made here belongs to the caller, who also ends it.
 */
struct _CMPIBrokerExtFT {
    int ftVersion;

    /** The file of the library with that bare name, as the platform writes it; the caller frees it. */
    char* (*resolveFileName)(const char* libraryName);

    /** @name Threads */
    ///@{

    /** Starts a thread; a detached one is not joined. */
    void* (*newThread)(void* (*start)(void*), void* argument, int detached);
    /** Waits for a thread; `result`, unless null, receives what it ended with. */
    int (*joinThread)(void* thread, void** result);
    /** Ends the calling thread. */
    int (*exitThread)(void* result);
    /** Asks a thread to end. */
    int (*cancelThread)(void* thread);
    /** Lets the calling thread sleep. */
    int (*threadSleep)(CMPIUint32 milliseconds);
    /** Calls `function` if it is the first call for this `once`, which starts as 0. */
    int (*threadOnce)(int* once, void (*function)(void));
    ///@}

    /** @name Values of a thread of its own */
    ///@{

    /** Makes a key; `cleanup`, unless null, is called with a thread's value when the thread ends. */
    int (*createThreadKey)(unsigned long* key, void (*cleanup)(void*));
    /** Gives a key up, without cleaning up any value. */
    int (*destroyThreadKey)(unsigned long key);
    /** The calling thread's value of a key; null when it has none. */
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
    /** Waits for a condition; the mutex is the caller's, and is released while it waits. */
    int (*condWait)(void* condition, void* mutex);
    /** Waits for a condition until a point in time at most. */
    int (*timedCondWait)(void* condition, void* mutex, struct timespec* until);
    /** Wakes who waits for a condition. */
    int (*signalCondition)(void* condition);
    ///@}
};

/** Memory of the broker, and the release of single objects before the request ends. */
struct _CMPIBrokerMemFT {
    const int ftVersion;

    /** @name Marks
     * For a thread that makes many objects in one request.
     */
    ///@{

    /** Remembers which objects the thread has made so far. */
    CMPIGcStat* (*mark)(const CMPIBroker* broker, CMPIStatus* rc);
    /** Releases what the thread has made since a mark. */
    CMPIStatus (*release)(const CMPIBroker* broker, const CMPIGcStat* mark);
    ///@}

    /** @name Allocation
     * As the C functions of these names, but freed by the broker when the request ends, unless it
     * was freed here before. Null when there is no memory.
     */
    ///@{
    void* (*cmpiMalloc)(const CMPIBroker* broker, size_t size);
    void* (*cmpiCalloc)(const CMPIBroker* broker, size_t count, size_t size);
    void* (*cmpiRealloc)(const CMPIBroker* broker, void* memory, size_t size);
    char* (*cmpiStrDup)(const CMPIBroker* broker, const char* text);
    void (*cmpiFree)(const CMPIBroker* broker, void* memory);
    ///@}

    /** @name Release of objects that the makers of CMPIBrokerEncFT made */
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
