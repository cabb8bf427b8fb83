#pragma once

#include <cmpift.h>

namespace cimhost {

/**
 * All function tables that a provider meets. Objects point into the set that their broker was made with, so it
 * must outlive the broker. Every slot is filled.
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

/** The tables of this host. They live as long as the program. */
const FunctionTables& standardTables();

}  // namespace cimhost
