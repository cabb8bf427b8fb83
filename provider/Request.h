#pragma once

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/** One request of the object manager: what it passed, all of it borrowed, and the status it will get. */
struct Request {
    const CMPIBroker* broker;
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    const char** properties = nullptr;       ///< property list, null for all
    const CMPIInstance* instance = nullptr;  ///< of a modification
    std::string nameSpace{};                 ///< of a creation
    CMPIStatus status{CMPI_RC_OK, nullptr};
};

}  // namespace KO::LeaseWarrantyProvider
