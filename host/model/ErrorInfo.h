#pragma once

#include <cmpidt.h>

#include <optional>
#include <string>
#include <vector>

namespace cimhost {

/** An extended error that a provider describes: the attributes of a CMPIError. Texts that are not set are none. */
struct ErrorInfo {
    std::optional<std::string> owningEntity{};
    std::optional<std::string> messageId{};
    std::optional<std::string> message{};
    CMPIErrorSeverity severity = ErrorSevUnknown;
    CMPIErrorProbableCause probableCause = ErrorProbCauseUnknown;
    CMPIrc statusCode = CMPI_RC_OK;
    CMPIErrorType type = UnknownErrorType;
    CMPIErrorSrcFormat sourceFormat = CMPIErrSrcUnknown;
    std::optional<std::string> otherType{};
    std::optional<std::string> probableCauseDescription{};
    std::optional<std::string> source{};
    std::optional<std::string> otherSourceFormat{};
    std::optional<std::string> statusCodeDescription{};
    std::optional<std::vector<std::string>> recommendedActions{};
    std::optional<std::vector<std::string>> messageArguments{};
};

}  // namespace cimhost
