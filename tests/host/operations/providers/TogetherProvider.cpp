#include <condition_variable>
#include <mutex>

#include "ProviderKit.h"

// A provider whose factory returns after it is called a second time concurrently.

namespace {

std::mutex mutex;
std::condition_variable changed;
int inside = 0;

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                              const char**) {
    return kit::ok;
}

CMPIInstanceMIFT table{CMPIVersion200, CMPIVersion200, "instanceTogether",
                       kit::cleanup,   nullptr,        enumerateInstances,
                       nullptr,        nullptr,        nullptr,
                       nullptr,        nullptr};
CMPIInstanceMI interface { nullptr, &table };

}  // namespace

KIT_EXPORT CMPIInstanceMI* Together_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
    std::unique_lock<std::mutex> lock(mutex);
    ++inside;
    changed.notify_all();
    changed.wait(lock, [] { return inside >= 2; });
    return &interface;
}
