#pragma once

#include <cmpift.h>

// The function tables, each defined beside its functions.

namespace cimhost {

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

/** Another setPropertyFilter of instances, under which keys that are not listed are hidden, too. */
CMPIStatus filterWithKeys(CMPIInstance* instance, const char** properties, const char** keys);

}  // namespace cimhost
