#include <condition_variable>
#include <mutex>

#include "ProviderKit.h"

// A provider whose factory comes back once two of its calls are inside at a time.

namespace {

std::mutex mutex;
std::condition_variable changed;
int inside = 0;

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return kit::ok;
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                              const char**) {
    return kit::ok;
}

CMPIInstanceMIFT table{
    CMPIVersion200, CMPIVersion200, "instanceTogether", cleanup, nullptr, enumerateInstances, nullptr, nullptr, nullptr,
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
