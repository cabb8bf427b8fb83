#include "broker/Convert.h"
#include "broker/Encapsulation.h"
#include "broker/Tables.h"

namespace cimhost {
namespace {

ResultEvents& events(const CMPIResult* result) {
    return *content(result).events;
}

/** What a result collects belongs to its request, so nothing of it can outlive that. */
CMPIResult* cloneResult(const CMPIResult* result, CMPIStatus* rc) {
    return guarded<CMPIResult*>(rc, nullptr, [&]() -> CMPIResult* {
        self(result);
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
    });
}

CMPIStatus returnData(const CMPIResult* result, const CMPIValue* value, const CMPIType type) {
    return guarded([&] {
        ResultEvents& target = events(result);
        target.emplace_back(valueFrom(value, type));
    });
}

CMPIStatus returnInstance(const CMPIResult* result, const CMPIInstance* instance) {
    return guarded([&] {
        ResultEvents& target = events(result);
        target.emplace_back(argument(instance).value);
    });
}

CMPIStatus returnObjectPath(const CMPIResult* result, const CMPIObjectPath* path) {
    return guarded([&] {
        ResultEvents& target = events(result);
        target.emplace_back(argument(path));
    });
}

CMPIStatus returnDone(const CMPIResult* result) {
    return guarded([&] { events(result).emplace_back(Done{}); });
}

CMPIStatus returnError(const CMPIResult* result, const CMPIError* error) {
    return guarded([&] {
        ResultEvents& target = events(result);
        target.emplace_back(argument(error));
    });
}

}  // namespace

const CMPIResultFT resultTable{tableVersion,   releaseObject<CMPIResult>, cloneResult, returnData,
                               returnInstance, returnObjectPath,          returnDone,  returnError};

}  // namespace cimhost
