#include "broker/FunctionTables.h"

namespace cimhost {

const FunctionTables& standardTables() {
    static const FunctionTables tables{
        brokerTable,   encapsulationTable, threadTable,      memoryTable, stringTable,  objectPathTable, instanceTable,
        dateTimeTable, arrayTable,         enumerationTable, argsTable,   contextTable, resultTable,     errorTable};
    return tables;
}

}  // namespace cimhost
