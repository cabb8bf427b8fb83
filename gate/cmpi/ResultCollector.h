#pragma once

#include "Failure.h"

#include <vector>

namespace gate {

/**
 * A CMPI result that collects the provider's answers, so that they can be checked before any is returned. The answers
 * belong to the object manager, which frees them when the request ends.
 */
struct ResultCollector {
    ResultCollector() : handle{this, &functions} {}
    ResultCollector(const ResultCollector&) = delete;
    ResultCollector& operator=(const ResultCollector&) = delete;

    std::vector<const CMPIInstance*> instances{};
    std::vector<const CMPIObjectPath*> paths{};
    bool isDone = false;  ///< whether the provider called returnDone
    CMPIResult handle;

private:
    static ResultCollector& of(const CMPIResult* result) { return *static_cast<ResultCollector*>(result->hdl); }

    static constexpr CMPIStatus ok{CMPI_RC_OK, nullptr};
    static constexpr CMPIStatus notSupported{CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

    static CMPIStatus release(CMPIResult*) { return ok; }

    static CMPIResult* clone(const CMPIResult*, CMPIStatus* rc) {
        if (rc != nullptr) {
            *rc = notSupported;
        }
        return nullptr;
    }

    static CMPIStatus returnData(const CMPIResult*, const CMPIValue*, CMPIType) { return notSupported; }

    static CMPIStatus returnInstance(const CMPIResult* result, const CMPIInstance* instance) {
        of(result).instances.push_back(instance);
        return ok;
    }

    static CMPIStatus returnObjectPath(const CMPIResult* result, const CMPIObjectPath* path) {
        of(result).paths.push_back(path);
        return ok;
    }

    static CMPIStatus returnDone(const CMPIResult* result) {
        of(result).isDone = true;
        return ok;
    }

    static CMPIStatus returnError(const CMPIResult*, const CMPIError*) { return notSupported; }

    static inline CMPIResultFT functions{CMPIVersion200, release,          clone,      returnData,
                                         returnInstance, returnObjectPath, returnDone, returnError};
};

}  // namespace gate
