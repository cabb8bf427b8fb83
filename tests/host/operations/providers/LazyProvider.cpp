#include "ProviderKit.h"

// A provider that refers to a function that nobody has, and calls it only when it is asked for an instance.

extern "C" CMPIStatus functionThatNobodyHas();

namespace {

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return kit::ok;
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                              const char**) {
    return kit::ok;
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char**) {
    return functionThatNobodyHas();
}

CMPIInstanceMIFT table{CMPIVersion200, CMPIVersion200, "instanceLazy", cleanup, nullptr, enumerateInstances,
                       getInstance,    nullptr,        nullptr,        nullptr, nullptr};
CMPIInstanceMI interface { nullptr, &table };

}  // namespace

KIT_EXPORT CMPIInstanceMI* Lazy_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
    return &interface;
}
