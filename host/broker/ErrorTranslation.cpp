#include "broker/ErrorTranslation.h"

#include "broker/Arena.h"
#include "broker/Broker.h"

namespace cimhost {

CMPIStatus toCmpi(const Status& status) noexcept {
    CMPIStatus answer{static_cast<CMPIrc>(status.rc), nullptr};
    Arena* arena = status.message.empty() ? nullptr : Broker::arenaOfThread();
    if (arena != nullptr) {
        try {
            answer.msg = arena->make<CMPIString>(status.message);
        } catch (...) {
            answer.msg = nullptr;  // out of memory: the code alone has to do
        }
    }
    return answer;
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

std::string argument(const char* text) {
    if (text == nullptr) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    return text;
}

}  // namespace cimhost
