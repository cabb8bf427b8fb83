#include "broker/ErrorTranslation.h"

#include <exception>

#include "broker/Arena.h"
#include "broker/Broker.h"

namespace cimhost {

CMPIStatus toCmpi(const Status& status) noexcept {
    CMPIStatus converted{static_cast<CMPIrc>(status.rc), nullptr};
    Arena* arena = status.message.empty() ? nullptr : Broker::arenaOfThread();
    if (arena != nullptr) {
        try {
            converted.msg = arena->make<CMPIString>(status.message);
        } catch (...) {
            converted.msg = nullptr;  // out of memory: return the code only
        }
    }
    return converted;
}

Status statusOfCurrentException() noexcept {
    try {
        try {
            throw;
        } catch (const Failure& failure) {
            return failure.status();
        } catch (const std::exception& error) {
            return {CMPI_RC_ERR_FAILED, error.what()};
        } catch (...) {
            return {CMPI_RC_ERR_FAILED, "unknown exception"};
        }
    } catch (...) {
        return {CMPI_RC_ERR_FAILED, {}};  // out of memory
    }
}

}  // namespace cimhost
