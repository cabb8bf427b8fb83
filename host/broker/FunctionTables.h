#pragma once

#include <cmpift.h>

#include <cstdarg>

namespace cimhost {

/** All function tables of a broker and its objects. They must outlive the broker. */
struct FunctionTables {
    CMPIBrokerFT broker;
    CMPIBrokerEncFT encapsulation;
    CMPIBrokerExtFT threads;
    CMPIBrokerMemFT memory;
    CMPIStringFT string;
    CMPIObjectPathFT objectPath;
    CMPIInstanceFT instance;
    CMPIDateTimeFT dateTime;
    CMPIArrayFT array;
    CMPIEnumerationFT enumeration;
    CMPIArgsFT args;
    CMPIContextFT context;
    CMPIResultFT result;
    CMPIErrorFT error;
};

/** The standard tables, with all functions; valid until the program ends. */
const FunctionTables& standardTables();

// The individual tables; each is defined in the file of its functions.

/** The version of CMPI that the tables implement. */
constexpr int tableVersion = CMPIVersion200;

extern const CMPIBrokerFT brokerTable;
extern const CMPIBrokerEncFT encapsulationTable;
extern const CMPIBrokerExtFT threadTable;
extern const CMPIBrokerMemFT memoryTable;
extern const CMPIStringFT stringTable;
extern const CMPIObjectPathFT objectPathTable;
extern const CMPIInstanceFT instanceTable;
extern const CMPIDateTimeFT dateTimeTable;
extern const CMPIArrayFT arrayTable;
extern const CMPIEnumerationFT enumerationTable;
extern const CMPIArgsFT argsTable;
extern const CMPIContextFT contextTable;
extern const CMPIResultFT resultTable;
extern const CMPIErrorFT errorTable;

/** A setPropertyFilter that also hides unlisted keys. */
CMPIStatus setPropertyFilterWithKeys(CMPIInstance* instance, const char** properties, const char** keys);

/** @name Messages with arguments
 * Return the default template with $0 to $9 replaced by the arguments. There are no translations.
 *
 * The variable arguments are `count` pairs, each a CMPIType and a value. The value has type sint32, uint32, sint64,
 * uint64, real64, boolean, chars or string. After an error, the functions return the template without replacements.
 */
///@{
CMPIString* getMessage(const CMPIBroker* broker, const char* id, const char* defaultTemplate, CMPIStatus* rc,
                       CMPICount count, ...);
CMPIString* getMessage2(const CMPIBroker* broker, const char* id, CMPIMsgFileHandle file, const char* defaultTemplate,
                        CMPIStatus* rc, CMPICount count, ...);

/** Implements both functions. */
CMPIString* messageFromList(const CMPIBroker* broker, const char* defaultTemplate, CMPIStatus* rc, CMPICount count,
                            va_list arguments);
///@}

}  // namespace cimhost
