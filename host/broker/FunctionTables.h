#pragma once

#include <cmpift.h>

namespace cimhost {

/**
 * All function tables that a provider meets. Objects point into the set that their broker was made with, so it
 * must outlive the broker.
 */
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

/** The tables of this host, with every function. They live as long as the program. */
const FunctionTables& standardTables();

// The single tables, each defined beside its functions.

/** Version of the standard that the tables follow. */
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

/** A setPropertyFilter for instances that also hides keys that are not listed. */
CMPIStatus setPropertyFilterWithKeys(CMPIInstance* instance, const char** properties, const char** keys);

}  // namespace cimhost
