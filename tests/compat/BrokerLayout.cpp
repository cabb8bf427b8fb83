// The broker and its tables.
#include <cmpift.h>

#include "Layout.h"

LAYOUT_SIZE(CMPIBroker, 5 * sizeof(void*));
LAYOUT_SLOT(CMPIBroker, 0, hdl, void*);
LAYOUT_SLOT(CMPIBroker, 1, bft, CMPIBrokerFT*);
LAYOUT_SLOT(CMPIBroker, 2, eft, CMPIBrokerEncFT*);
LAYOUT_SLOT(CMPIBroker, 3, xft, CMPIBrokerExtFT*);
LAYOUT_SLOT(CMPIBroker, 4, mft, CMPIBrokerMemFT*);

LAYOUT_SIZE(CMPIBrokerFT, 20 * sizeof(void*));
LAYOUT_MEMBER(CMPIBrokerFT, brokerCapabilities, 0, unsigned int);
LAYOUT_MEMBER(CMPIBrokerFT, brokerVersion, 4, unsigned int);
LAYOUT_SLOT(CMPIBrokerFT, 1, brokerName, const char*);
LAYOUT_SLOT(CMPIBrokerFT, 2, prepareAttachThread, CMPIContext* (*)(const CMPIBroker*, const CMPIContext*));
LAYOUT_SLOT(CMPIBrokerFT, 3, attachThread, CMPIStatus (*)(const CMPIBroker*, const CMPIContext*));
LAYOUT_SLOT(CMPIBrokerFT, 4, detachThread, CMPIStatus (*)(const CMPIBroker*, const CMPIContext*));
LAYOUT_SLOT(CMPIBrokerFT, 5, deliverIndication,
            CMPIStatus (*)(const CMPIBroker*, const CMPIContext*, const char*, const CMPIInstance*));
LAYOUT_SLOT(CMPIBrokerFT, 6, enumerateInstanceNames,
            CMPIEnumeration* (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 7, getInstance,
            CMPIInstance* (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char**, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 8, createInstance,
            CMPIObjectPath* (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const CMPIInstance*,
                                CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 9, modifyInstance,
            CMPIStatus (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const CMPIInstance*,
                           const char**));
LAYOUT_SLOT(CMPIBrokerFT, 10, deleteInstance,
            CMPIStatus (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*));
LAYOUT_SLOT(CMPIBrokerFT, 11, execQuery,
            CMPIEnumeration* (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                                 CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 12, enumerateInstances,
            CMPIEnumeration* (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char**,
                                 CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 13, associators,
            CMPIEnumeration* (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                                 const char*, const char*, const char**, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 14, associatorNames,
            CMPIEnumeration* (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                                 const char*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 15, references,
            CMPIEnumeration* (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                                 const char**, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 16, referenceNames,
            CMPIEnumeration* (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const char*,
                                 CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 17, invokeMethod,
            CMPIData (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const CMPIArgs*,
                         CMPIArgs*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerFT, 18, setProperty,
            CMPIStatus (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, const CMPIValue*,
                           CMPIType));
LAYOUT_SLOT(CMPIBrokerFT, 19, getProperty,
            CMPIData (*)(const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char*, CMPIStatus*));

LAYOUT_TABLE(CMPIBrokerEncFT, 21);
LAYOUT_SLOT(CMPIBrokerEncFT, 1, newInstance, CMPIInstance* (*)(const CMPIBroker*, const CMPIObjectPath*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 2, newObjectPath,
            CMPIObjectPath* (*)(const CMPIBroker*, const char*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 3, newArgs, CMPIArgs* (*)(const CMPIBroker*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 4, newString, CMPIString* (*)(const CMPIBroker*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 5, newArray, CMPIArray* (*)(const CMPIBroker*, CMPICount, CMPIType, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 6, newDateTime, CMPIDateTime* (*)(const CMPIBroker*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 7, newDateTimeFromBinary,
            CMPIDateTime* (*)(const CMPIBroker*, CMPIUint64, CMPIBoolean, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 8, newDateTimeFromChars, CMPIDateTime* (*)(const CMPIBroker*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 9, newSelectExp,
            CMPISelectExp* (*)(const CMPIBroker*, const char*, const char*, CMPIArray**, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 10, classPathIsA,
            CMPIBoolean (*)(const CMPIBroker*, const CMPIObjectPath*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 11, toString, CMPIString* (*)(const CMPIBroker*, const void*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 12, isOfType, CMPIBoolean (*)(const CMPIBroker*, const void*, const char*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 13, getType, CMPIString* (*)(const CMPIBroker*, const void*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 14, getMessage,
            CMPIString* (*)(const CMPIBroker*, const char*, const char*, CMPIStatus*, CMPICount, ...));
LAYOUT_SLOT(CMPIBrokerEncFT, 15, logMessage,
            CMPIStatus (*)(const CMPIBroker*, int, const char*, const char*, const CMPIString*));
LAYOUT_SLOT(CMPIBrokerEncFT, 16, trace,
            CMPIStatus (*)(const CMPIBroker*, int, const char*, const char*, const CMPIString*));
LAYOUT_SLOT(CMPIBrokerEncFT, 17, newCMPIError,
            CMPIError* (*)(const CMPIBroker*, const char*, const char*, const char*, const CMPIErrorSeverity,
                           const CMPIErrorProbableCause, const CMPIrc, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerEncFT, 18, openMessageFile, CMPIStatus (*)(const CMPIBroker*, const char*, CMPIMsgFileHandle*));
LAYOUT_SLOT(CMPIBrokerEncFT, 19, closeMessageFile, CMPIStatus (*)(const CMPIBroker*, const CMPIMsgFileHandle));
LAYOUT_SLOT(CMPIBrokerEncFT, 20, getMessage2,
            CMPIString* (*)(const CMPIBroker*, const char*, const CMPIMsgFileHandle, const char*, CMPIStatus*,
                            CMPICount, ...));

LAYOUT_TABLE(CMPIBrokerExtFT, 21);
LAYOUT_SLOT(CMPIBrokerExtFT, 1, resolveFileName, char* (*)(const char*));
LAYOUT_SLOT(CMPIBrokerExtFT, 2, newThread, void* (*)(void* (*)(void*), void*, int));
LAYOUT_SLOT(CMPIBrokerExtFT, 3, joinThread, int (*)(void*, void**));
LAYOUT_SLOT(CMPIBrokerExtFT, 4, exitThread, int (*)(void*));
LAYOUT_SLOT(CMPIBrokerExtFT, 5, cancelThread, int (*)(void*));
LAYOUT_SLOT(CMPIBrokerExtFT, 6, threadSleep, int (*)(CMPIUint32));
LAYOUT_SLOT(CMPIBrokerExtFT, 7, threadOnce, int (*)(int*, void (*)(void)));
LAYOUT_SLOT(CMPIBrokerExtFT, 8, createThreadKey, int (*)(unsigned long*, void (*)(void*)));
LAYOUT_SLOT(CMPIBrokerExtFT, 9, destroyThreadKey, int (*)(unsigned long));
LAYOUT_SLOT(CMPIBrokerExtFT, 10, getThreadSpecific, void* (*)(unsigned long));
LAYOUT_SLOT(CMPIBrokerExtFT, 11, setThreadSpecific, int (*)(unsigned long, void*));
LAYOUT_SLOT(CMPIBrokerExtFT, 12, newMutex, void* (*)(int));
LAYOUT_SLOT(CMPIBrokerExtFT, 13, destroyMutex, void (*)(void*));
LAYOUT_SLOT(CMPIBrokerExtFT, 14, lockMutex, void (*)(void*));
LAYOUT_SLOT(CMPIBrokerExtFT, 15, unlockMutex, void (*)(void*));
LAYOUT_SLOT(CMPIBrokerExtFT, 16, newCondition, void* (*)(int));
LAYOUT_SLOT(CMPIBrokerExtFT, 17, destroyCondition, void (*)(void*));
LAYOUT_SLOT(CMPIBrokerExtFT, 18, condWait, int (*)(void*, void*));
LAYOUT_SLOT(CMPIBrokerExtFT, 19, timedCondWait, int (*)(void*, void*, struct timespec*));
LAYOUT_SLOT(CMPIBrokerExtFT, 20, signalCondition, int (*)(void*));

LAYOUT_TABLE(CMPIBrokerMemFT, 15);
LAYOUT_SLOT(CMPIBrokerMemFT, 1, mark, CMPIGcStat* (*)(const CMPIBroker*, CMPIStatus*));
LAYOUT_SLOT(CMPIBrokerMemFT, 2, release, CMPIStatus (*)(const CMPIBroker*, const CMPIGcStat*));
LAYOUT_SLOT(CMPIBrokerMemFT, 3, cmpiMalloc, void* (*)(const CMPIBroker*, size_t));
LAYOUT_SLOT(CMPIBrokerMemFT, 4, cmpiCalloc, void* (*)(const CMPIBroker*, size_t, size_t));
LAYOUT_SLOT(CMPIBrokerMemFT, 5, cmpiRealloc, void* (*)(const CMPIBroker*, void*, size_t));
LAYOUT_SLOT(CMPIBrokerMemFT, 6, cmpiStrDup, char* (*)(const CMPIBroker*, const char*));
LAYOUT_SLOT(CMPIBrokerMemFT, 7, cmpiFree, void (*)(const CMPIBroker*, void*));
LAYOUT_SLOT(CMPIBrokerMemFT, 8, freeInstance, void (*)(const CMPIBroker*, CMPIInstance*));
LAYOUT_SLOT(CMPIBrokerMemFT, 9, freeObjectPath, void (*)(const CMPIBroker*, CMPIObjectPath*));
LAYOUT_SLOT(CMPIBrokerMemFT, 10, freeArgs, void (*)(const CMPIBroker*, CMPIArgs*));
LAYOUT_SLOT(CMPIBrokerMemFT, 11, freeString, void (*)(const CMPIBroker*, CMPIString*));
LAYOUT_SLOT(CMPIBrokerMemFT, 12, freeArray, void (*)(const CMPIBroker*, CMPIArray*));
LAYOUT_SLOT(CMPIBrokerMemFT, 13, freeDateTime, void (*)(const CMPIBroker*, CMPIDateTime*));
LAYOUT_SLOT(CMPIBrokerMemFT, 14, freeSelectExp, void (*)(const CMPIBroker*, CMPISelectExp*));
