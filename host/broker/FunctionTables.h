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

enum class Manager;

/** The tables of this host, with every function. They live as long as the program. */
const FunctionTables& standardTables();

/** The same as they look under an object manager. They live as long as the program. */
const FunctionTables& tablesOf(Manager manager);

}  // namespace cimhost
