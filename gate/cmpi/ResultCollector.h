#pragma once

#include <vector>

#include "Failure.h"

namespace gate {

/** The provider's answer to a request. Its objects belong to the object manager, which frees them with the request. */
struct ProviderAnswer {
    std::vector<const CMPIInstance*> instances{};
    std::vector<const CMPIObjectPath*> paths{};
    bool isDone = false;  ///< whether the provider called returnDone
};

/**
 * A CMPI result that collects the provider's answer, so that it can be checked before any of it is returned. It has
 * only the functions that the provider calls.
 */
class ResultCollector {
public:
    ResultCollector() = default;
    ResultCollector(const ResultCollector&) = delete;
    ResultCollector& operator=(const ResultCollector&) = delete;

    const CMPIResult* handle() const { return &result; }

    ProviderAnswer answer{};

private:
    static ProviderAnswer& of(const CMPIResult* result) { return static_cast<ResultCollector*>(result->hdl)->answer; }

    static CMPIStatus returnInstance(const CMPIResult* result, const CMPIInstance* instance) {
        of(result).instances.push_back(instance);
        return {CMPI_RC_OK, nullptr};
    }

    static CMPIStatus returnObjectPath(const CMPIResult* result, const CMPIObjectPath* path) {
        of(result).paths.push_back(path);
        return {CMPI_RC_OK, nullptr};
    }

    static CMPIStatus returnDone(const CMPIResult* result) {
        of(result).isDone = true;
        return {CMPI_RC_OK, nullptr};
    }

    static inline CMPIResultFT functions{CMPIVersion200, nullptr,          nullptr,    nullptr,
                                         returnInstance, returnObjectPath, returnDone, nullptr};

    CMPIResult result{this, &functions};
};

}  // namespace gate
