#include "broker/Convert.h"
#include "broker/Encapsulation.h"
#include "broker/FunctionTables.h"

namespace cimhost {
namespace {

ResultEvents& events(const CMPIResult* result) {
    return *content(result).events;
}

/** Records a null pointer before argument() rejects it. */
template <class Handle>
void recordNull(const ResultContent& target, const Handle* returned) {
    if (returned == nullptr) {
        target.events->emplace_back(NullResult{});
    }
}

void noticeRelease(ResultContent& result, const CMPIObjectPath* path) {
    if (result.pathReleased == nullptr) {
        result.pathReleased = std::make_shared<bool>(false);
    }
    objectOf(path)->released = result.pathReleased;
}

/** Fails: the events of a result belong to its request, which a clone can outlive. */
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
        const ResultContent& target = content(result);
        if (target.rules.refusesInstances) {
            throw Failure(CMPI_RC_ERR_NOT_SUPPORTED);
        }
        recordNull(target, instance);
        InstanceContent& returned = argument(instance);
        if (returned.classInfo != nullptr) {
            returned.classInfo->usualCount = returned.value->properties.size();
        }
        target.events->emplace_back(returned.value.share());
    });
}

CMPIStatus returnObjectPath(const CMPIResult* result, const CMPIObjectPath* path) {
    return guarded([&] {
        ResultContent& target = content(result);
        recordNull(target, path);
        target.events->emplace_back(argument(path).share());
        if (target.rules.keepsPaths) {
            noticeRelease(target, path);
        }
    });
}

CMPIStatus returnDone(const CMPIResult* result) {
    return guarded([&] {
        const ResultContent& target = content(result);
        if (target.rules.refusesToBeEmpty && target.events->empty()) {
            throw Failure(CMPI_RC_ERR_FAILED, "Too few objects delivered.");
        }
        target.events->emplace_back(Done{});
    });
}

CMPIStatus returnError(const CMPIResult* result, const CMPIError* error) {
    return guarded([&] {
        const ResultContent& target = content(result);
        recordNull(target, error);
        target.events->emplace_back(std::make_shared<const ErrorInfo>(argument(error)));
    });
}

}  // namespace

const CMPIResultFT resultTable{tableVersion,   releaseObject<CMPIResult>, cloneResult, returnData,
                               returnInstance, returnObjectPath,          returnDone,  returnError};

}  // namespace cimhost
