#include <cstdarg>

#include "broker/FunctionTables.h"
#include "support/Recording.h"

// The function tables of RecordingBroker: each slot is the recording function of the standard tables' slot.

namespace testsupport {
namespace {

std::set<std::string>& names() {
    static std::set<std::string> all;
    return all;
}

/** Replaces the function in a slot by the recording function. */
template <auto slot, class Table>
void record(Table& table, const char* name) {
    Recorded<slot>::name = name;
    Recorded<slot>::original = table.*slot;
    table.*slot = &Recorded<slot>::call;
    names().insert(name);
}

// The templates do not support functions with a variable number of arguments.

constexpr const char* getMessageName = "CMPIBrokerEncFT.getMessage";
constexpr const char* getMessage2Name = "CMPIBrokerEncFT.getMessage2";

CMPIString* recordMessage(const char* function, const CMPIBroker* broker, const char* id, const char* text,
                          CMPIStatus* rc, CMPICount count, va_list inserts) {
    const BrokerScope scope;
    Recording* recording = recordingOf(tableOf(broker));
    const auto verdict =
        recording == nullptr ? std::nullopt : recording->note({function, describeAll(broker, id, text, count)});
    if (verdict) {
        setStatus(rc, verdict->rc);
        return nullptr;
    }
    return cimhost::messageFromList(broker, text, rc, count, inserts);
}

CMPIString* getMessage(const CMPIBroker* broker, const char* id, const char* text, CMPIStatus* rc, CMPICount count,
                       ...) {
    va_list inserts;
    va_start(inserts, count);
    CMPIString* message = recordMessage(getMessageName, broker, id, text, rc, count, inserts);
    va_end(inserts);
    return message;
}

CMPIString* getMessage2(const CMPIBroker* broker, const char* id, CMPIMsgFileHandle, const char* text, CMPIStatus* rc,
                        CMPICount count, ...) {
    va_list inserts;
    va_start(inserts, count);
    CMPIString* message = recordMessage(getMessage2Name, broker, id, text, rc, count, inserts);
    va_end(inserts);
    return message;
}

#define RECORD(member, Table, function) record<&Table::function>(tables.member, #Table "." #function)

void recordBrokerTable(cimhost::FunctionTables& tables) {
    RECORD(broker, CMPIBrokerFT, prepareAttachThread);
    RECORD(broker, CMPIBrokerFT, attachThread);
    RECORD(broker, CMPIBrokerFT, detachThread);
    RECORD(broker, CMPIBrokerFT, deliverIndication);
    RECORD(broker, CMPIBrokerFT, enumerateInstanceNames);
    RECORD(broker, CMPIBrokerFT, getInstance);
    RECORD(broker, CMPIBrokerFT, createInstance);
    RECORD(broker, CMPIBrokerFT, modifyInstance);
    RECORD(broker, CMPIBrokerFT, deleteInstance);
    RECORD(broker, CMPIBrokerFT, execQuery);
    RECORD(broker, CMPIBrokerFT, enumerateInstances);
    RECORD(broker, CMPIBrokerFT, associators);
    RECORD(broker, CMPIBrokerFT, associatorNames);
    RECORD(broker, CMPIBrokerFT, references);
    RECORD(broker, CMPIBrokerFT, referenceNames);
    RECORD(broker, CMPIBrokerFT, invokeMethod);
    RECORD(broker, CMPIBrokerFT, setProperty);
    RECORD(broker, CMPIBrokerFT, getProperty);
}

void recordEncapsulationTable(cimhost::FunctionTables& tables) {
    RECORD(encapsulation, CMPIBrokerEncFT, newInstance);
    RECORD(encapsulation, CMPIBrokerEncFT, newObjectPath);
    RECORD(encapsulation, CMPIBrokerEncFT, newArgs);
    RECORD(encapsulation, CMPIBrokerEncFT, newString);
    RECORD(encapsulation, CMPIBrokerEncFT, newArray);
    RECORD(encapsulation, CMPIBrokerEncFT, newDateTime);
    RECORD(encapsulation, CMPIBrokerEncFT, newDateTimeFromBinary);
    RECORD(encapsulation, CMPIBrokerEncFT, newDateTimeFromChars);
    RECORD(encapsulation, CMPIBrokerEncFT, newSelectExp);
    RECORD(encapsulation, CMPIBrokerEncFT, classPathIsA);
    RECORD(encapsulation, CMPIBrokerEncFT, toString);
    RECORD(encapsulation, CMPIBrokerEncFT, isOfType);
    RECORD(encapsulation, CMPIBrokerEncFT, getType);
    tables.encapsulation.getMessage = &getMessage;
    names().insert(getMessageName);
    RECORD(encapsulation, CMPIBrokerEncFT, logMessage);
    RECORD(encapsulation, CMPIBrokerEncFT, trace);
    RECORD(encapsulation, CMPIBrokerEncFT, newCMPIError);
    RECORD(encapsulation, CMPIBrokerEncFT, openMessageFile);
    RECORD(encapsulation, CMPIBrokerEncFT, closeMessageFile);
    tables.encapsulation.getMessage2 = &getMessage2;
    names().insert(getMessage2Name);
}

void recordThreadsTable(cimhost::FunctionTables& tables) {
    RECORD(threads, CMPIBrokerExtFT, resolveFileName);
    RECORD(threads, CMPIBrokerExtFT, newThread);
    RECORD(threads, CMPIBrokerExtFT, joinThread);
    RECORD(threads, CMPIBrokerExtFT, exitThread);
    RECORD(threads, CMPIBrokerExtFT, cancelThread);
    RECORD(threads, CMPIBrokerExtFT, threadSleep);
    RECORD(threads, CMPIBrokerExtFT, threadOnce);
    RECORD(threads, CMPIBrokerExtFT, createThreadKey);
    RECORD(threads, CMPIBrokerExtFT, destroyThreadKey);
    RECORD(threads, CMPIBrokerExtFT, getThreadSpecific);
    RECORD(threads, CMPIBrokerExtFT, setThreadSpecific);
    RECORD(threads, CMPIBrokerExtFT, newMutex);
    RECORD(threads, CMPIBrokerExtFT, destroyMutex);
    RECORD(threads, CMPIBrokerExtFT, lockMutex);
    RECORD(threads, CMPIBrokerExtFT, unlockMutex);
    RECORD(threads, CMPIBrokerExtFT, newCondition);
    RECORD(threads, CMPIBrokerExtFT, destroyCondition);
    RECORD(threads, CMPIBrokerExtFT, condWait);
    RECORD(threads, CMPIBrokerExtFT, timedCondWait);
    RECORD(threads, CMPIBrokerExtFT, signalCondition);
}

void recordMemoryTable(cimhost::FunctionTables& tables) {
    RECORD(memory, CMPIBrokerMemFT, mark);
    RECORD(memory, CMPIBrokerMemFT, release);
    RECORD(memory, CMPIBrokerMemFT, cmpiMalloc);
    RECORD(memory, CMPIBrokerMemFT, cmpiCalloc);
    RECORD(memory, CMPIBrokerMemFT, cmpiRealloc);
    RECORD(memory, CMPIBrokerMemFT, cmpiStrDup);
    RECORD(memory, CMPIBrokerMemFT, cmpiFree);
    RECORD(memory, CMPIBrokerMemFT, freeInstance);
    RECORD(memory, CMPIBrokerMemFT, freeObjectPath);
    RECORD(memory, CMPIBrokerMemFT, freeArgs);
    RECORD(memory, CMPIBrokerMemFT, freeString);
    RECORD(memory, CMPIBrokerMemFT, freeArray);
    RECORD(memory, CMPIBrokerMemFT, freeDateTime);
    RECORD(memory, CMPIBrokerMemFT, freeSelectExp);
}

void recordStringTable(cimhost::FunctionTables& tables) {
    RECORD(string, CMPIStringFT, release);
    RECORD(string, CMPIStringFT, clone);
    RECORD(string, CMPIStringFT, getCharPtr);
}

void recordObjectPathTable(cimhost::FunctionTables& tables) {
    RECORD(objectPath, CMPIObjectPathFT, release);
    RECORD(objectPath, CMPIObjectPathFT, clone);
    RECORD(objectPath, CMPIObjectPathFT, setNameSpace);
    RECORD(objectPath, CMPIObjectPathFT, getNameSpace);
    RECORD(objectPath, CMPIObjectPathFT, setHostname);
    RECORD(objectPath, CMPIObjectPathFT, getHostname);
    RECORD(objectPath, CMPIObjectPathFT, setClassName);
    RECORD(objectPath, CMPIObjectPathFT, getClassName);
    RECORD(objectPath, CMPIObjectPathFT, addKey);
    RECORD(objectPath, CMPIObjectPathFT, getKey);
    RECORD(objectPath, CMPIObjectPathFT, getKeyAt);
    RECORD(objectPath, CMPIObjectPathFT, getKeyCount);
    RECORD(objectPath, CMPIObjectPathFT, setNameSpaceFromObjectPath);
    RECORD(objectPath, CMPIObjectPathFT, setHostAndNameSpaceFromObjectPath);
    RECORD(objectPath, CMPIObjectPathFT, getClassQualifier);
    RECORD(objectPath, CMPIObjectPathFT, getPropertyQualifier);
    RECORD(objectPath, CMPIObjectPathFT, getMethodQualifier);
    RECORD(objectPath, CMPIObjectPathFT, getParameterQualifier);
    RECORD(objectPath, CMPIObjectPathFT, toString);
}

void recordInstanceTable(cimhost::FunctionTables& tables) {
    RECORD(instance, CMPIInstanceFT, release);
    RECORD(instance, CMPIInstanceFT, clone);
    RECORD(instance, CMPIInstanceFT, getProperty);
    RECORD(instance, CMPIInstanceFT, getPropertyAt);
    RECORD(instance, CMPIInstanceFT, getPropertyCount);
    RECORD(instance, CMPIInstanceFT, setProperty);
    RECORD(instance, CMPIInstanceFT, getObjectPath);
    RECORD(instance, CMPIInstanceFT, setPropertyFilter);
    RECORD(instance, CMPIInstanceFT, setObjectPath);
    RECORD(instance, CMPIInstanceFT, setPropertyWithOrigin);
}

void recordDateTimeTable(cimhost::FunctionTables& tables) {
    RECORD(dateTime, CMPIDateTimeFT, release);
    RECORD(dateTime, CMPIDateTimeFT, clone);
    RECORD(dateTime, CMPIDateTimeFT, getBinaryFormat);
    RECORD(dateTime, CMPIDateTimeFT, getStringFormat);
    RECORD(dateTime, CMPIDateTimeFT, isInterval);
}

void recordArrayTable(cimhost::FunctionTables& tables) {
    RECORD(array, CMPIArrayFT, release);
    RECORD(array, CMPIArrayFT, clone);
    RECORD(array, CMPIArrayFT, getSize);
    RECORD(array, CMPIArrayFT, getSimpleType);
    RECORD(array, CMPIArrayFT, getElementAt);
    RECORD(array, CMPIArrayFT, setElementAt);
}

void recordEnumerationTable(cimhost::FunctionTables& tables) {
    RECORD(enumeration, CMPIEnumerationFT, release);
    RECORD(enumeration, CMPIEnumerationFT, clone);
    RECORD(enumeration, CMPIEnumerationFT, getNext);
    RECORD(enumeration, CMPIEnumerationFT, hasNext);
    RECORD(enumeration, CMPIEnumerationFT, toArray);
}

void recordArgsTable(cimhost::FunctionTables& tables) {
    RECORD(args, CMPIArgsFT, release);
    RECORD(args, CMPIArgsFT, clone);
    RECORD(args, CMPIArgsFT, addArg);
    RECORD(args, CMPIArgsFT, getArg);
    RECORD(args, CMPIArgsFT, getArgAt);
    RECORD(args, CMPIArgsFT, getArgCount);
}

void recordContextTable(cimhost::FunctionTables& tables) {
    RECORD(context, CMPIContextFT, release);
    RECORD(context, CMPIContextFT, clone);
    RECORD(context, CMPIContextFT, getEntry);
    RECORD(context, CMPIContextFT, getEntryAt);
    RECORD(context, CMPIContextFT, getEntryCount);
    RECORD(context, CMPIContextFT, addEntry);
}

void recordResultTable(cimhost::FunctionTables& tables) {
    RECORD(result, CMPIResultFT, release);
    RECORD(result, CMPIResultFT, clone);
    RECORD(result, CMPIResultFT, returnData);
    RECORD(result, CMPIResultFT, returnInstance);
    RECORD(result, CMPIResultFT, returnObjectPath);
    RECORD(result, CMPIResultFT, returnDone);
    RECORD(result, CMPIResultFT, returnError);
}

void recordErrorTable(cimhost::FunctionTables& tables) {
    RECORD(error, CMPIErrorFT, release);
    RECORD(error, CMPIErrorFT, clone);
    RECORD(error, CMPIErrorFT, getErrorType);
    RECORD(error, CMPIErrorFT, getOtherErrorType);
    RECORD(error, CMPIErrorFT, getOwningEntity);
    RECORD(error, CMPIErrorFT, getMessageID);
    RECORD(error, CMPIErrorFT, getMessage);
    RECORD(error, CMPIErrorFT, getPerceivedSeverity);
    RECORD(error, CMPIErrorFT, getProbableCause);
    RECORD(error, CMPIErrorFT, getProbableCauseDescription);
    RECORD(error, CMPIErrorFT, getRecommendedActions);
    RECORD(error, CMPIErrorFT, getErrorSource);
    RECORD(error, CMPIErrorFT, getErrorSourceFormat);
    RECORD(error, CMPIErrorFT, getOtherErrorSourceFormat);
    RECORD(error, CMPIErrorFT, getCIMStatusCode);
    RECORD(error, CMPIErrorFT, getCIMStatusCodeDescription);
    RECORD(error, CMPIErrorFT, getMessageArguments);
    RECORD(error, CMPIErrorFT, setErrorType);
    RECORD(error, CMPIErrorFT, setOtherErrorType);
    RECORD(error, CMPIErrorFT, setProbableCauseDescription);
    RECORD(error, CMPIErrorFT, setRecommendedActions);
    RECORD(error, CMPIErrorFT, setErrorSource);
    RECORD(error, CMPIErrorFT, setErrorSourceFormat);
    RECORD(error, CMPIErrorFT, setOtherErrorSourceFormat);
    RECORD(error, CMPIErrorFT, setCIMStatusCodeDescription);
    RECORD(error, CMPIErrorFT, setMessageArguments);
}

#undef RECORD

/** Made once: making them sets the names by which functions of all brokers are recorded. */
cimhost::FunctionTables makeTables() {
    cimhost::FunctionTables tables = cimhost::standardTables();
    recordBrokerTable(tables);
    recordEncapsulationTable(tables);
    recordThreadsTable(tables);
    recordMemoryTable(tables);
    recordStringTable(tables);
    recordObjectPathTable(tables);
    recordInstanceTable(tables);
    recordDateTimeTable(tables);
    recordArrayTable(tables);
    recordEnumerationTable(tables);
    recordArgsTable(tables);
    recordContextTable(tables);
    recordResultTable(tables);
    recordErrorTable(tables);
    return tables;
}

}  // namespace

cimhost::FunctionTables recordingTables() {
    static const cimhost::FunctionTables tables = makeTables();
    return tables;
}

const std::set<std::string>& recordedFunctions() {
    return names();
}

}  // namespace testsupport
