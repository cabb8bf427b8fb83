#include "ProviderKit.h"

// A provider with an undefined function, which getInstance calls.

extern "C" CMPIStatus undefinedFunction();

namespace {

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                              const char**) {
    return kit::ok;
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char**) {
    return undefinedFunction();
}

CMPIInstanceMIFT table{CMPIVersion200, CMPIVersion200, "instanceLazy", kit::cleanup, nullptr, enumerateInstances,
                       getInstance,    nullptr,        nullptr,        nullptr,      nullptr};
CMPIInstanceMI interface { nullptr, &table };

}  // namespace

KIT_EXPORT CMPIInstanceMI* Lazy_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
    return &interface;
}
