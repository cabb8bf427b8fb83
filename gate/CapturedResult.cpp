#include "CapturedResult.h"

namespace gate {

namespace {

CapturedResult& captured(const CMPIResult* result) {
    return *static_cast<CapturedResult*>(result->hdl);
}

constexpr CMPIStatus ok{CMPI_RC_OK, nullptr};
constexpr CMPIStatus notSupported{CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

CMPIStatus release(CMPIResult*) {
    return ok;
}

CMPIResult* clone(const CMPIResult*, CMPIStatus* rc) {
    if (rc != nullptr) {
        *rc = notSupported;
    }
    return nullptr;
}

CMPIStatus returnData(const CMPIResult*, const CMPIValue*, const CMPIType) {
    return notSupported;
}

CMPIStatus returnInstance(const CMPIResult* result, const CMPIInstance* instance) {
    captured(result).instances.push_back(instance);
    return ok;
}

CMPIStatus returnObjectPath(const CMPIResult* result, const CMPIObjectPath* path) {
    captured(result).paths.push_back(path);
    return ok;
}

CMPIStatus returnDone(const CMPIResult* result) {
    captured(result).isDone = true;
    return ok;
}

CMPIStatus returnError(const CMPIResult*, const CMPIError*) {
    return notSupported;
}

CMPIResultFT functions{CMPIVersion200, release,          clone,      returnData,
                       returnInstance, returnObjectPath, returnDone, returnError};

}  // namespace

CapturedResult::CapturedResult() : handle{this, &functions} {}

}  // namespace gate
