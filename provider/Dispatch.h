#pragma once

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/** A call to one of the provider's entry points: its arguments, all borrowed, and the status to return. */
struct Invocation {
    const CMPIBroker* broker;
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    const char** properties = nullptr;       ///< property list, null for all
    const CMPIInstance* instance = nullptr;  ///< of ModifyInstance
    std::string nameSpace{};                 ///< of CreateInstance
    CMPIStatus status{CMPI_RC_OK, nullptr};
};

/** Performs an operation for a class: calls the class's adapter, or sets an error status. */
using Handler = void (*)(Invocation&);

/** The handlers of the operations for one class. */
struct ClassHandlers {
    unsigned short classId;
    Handler enumInstanceNames;
    Handler enumInstances;
    Handler getInstance;
    Handler createInstance;
    Handler modifyInstance;
    Handler deleteInstance;
    Handler associators;
    Handler associatorNames;
};

/** Returns the handlers of a class. If the provider does not serve it, each handler is &Handlers::invalidClass. */
const ClassHandlers& handlersOf(unsigned short classId);

}  // namespace KO::LeaseWarrantyProvider
