#include "broker/FunctionTables.h"

#include "broker/Profile.h"
#include "broker/Tables.h"

namespace cimhost {
namespace {

FunctionTables withGaps(Manager manager) {
    FunctionTables tables = standardTables();
    applyGaps(profileOf(manager), tables);
    return tables;
}

}  // namespace

const FunctionTables& standardTables() {
    static const FunctionTables tables{
        brokerTable,   encapsulationTable, threadTable,      memoryTable, stringTable,  objectPathTable, instanceTable,
        dateTimeTable, arrayTable,         enumerationTable, argsTable,   contextTable, resultTable,     errorTable};
    return tables;
}

const FunctionTables& tablesOf(Manager manager) {
    static const FunctionTables sfcb = withGaps(Manager::sfcb);
    return manager == Manager::sfcb ? sfcb : standardTables();
}

}  // namespace cimhost
