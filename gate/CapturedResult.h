#pragma once

#include <cmpift.h>

#include <vector>

namespace gate {

/**
 * Where the provider puts its answers, for the gate to look at before anything goes out. What is captured belongs to
 * the object manager and lives until the request ends.
 */
struct CapturedResult {
    CapturedResult();
    CapturedResult(const CapturedResult&) = delete;
    CapturedResult& operator=(const CapturedResult&) = delete;

    std::vector<const CMPIInstance*> instances{};
    std::vector<const CMPIObjectPath*> paths{};
    bool isDone = false;  ///< whether the provider said that nothing follows
    CMPIResult handle;
};

}  // namespace gate
