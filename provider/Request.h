#pragma once

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/** A request of the object manager: its arguments, all borrowed, and the status to return. */
struct Request {
    const CMPIBroker* broker;
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    const char** properties = nullptr;       ///< property list, null for all
    const CMPIInstance* instance = nullptr;  ///< of ModifyInstance
    std::string nameSpace{};                 ///< of CreateInstance
    CMPIStatus status{CMPI_RC_OK, nullptr};
};

}  // namespace KO::LeaseWarrantyProvider
