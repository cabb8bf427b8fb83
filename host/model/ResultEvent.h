#pragma once

#include <cmpidt.h>

#include <algorithm>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include "model/Value.h"

namespace cimhost {

/** The attributes of a CMPIError. */
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

/** A call of returnDone. */
struct Done {};

/** A null pointer that a provider returned as an instance, an object path or an error. The result rejects it. */
struct NullResult {};

/** One call of a result function: an instance, an object path, data, an error or null was returned, or returnDone. */
using ResultEvent = std::variant<Instance, ObjectPath, Value, ErrorInfo, NullResult, Done>;

/** The results of a provider, in order. Each is a copy made at the time of the call. */
using ResultEvents = std::vector<ResultEvent>;

/** All events of one kind, in order. */
template <class Kind>
std::vector<Kind> eventsOf(const ResultEvents& events) {
    std::vector<Kind> found;
    for (const ResultEvent& event : events) {
        if (const Kind* one = std::get_if<Kind>(&event)) {
            found.push_back(*one);
        }
    }
    return found;
}

/** Number of calls of returnDone. */
inline int doneCount(const ResultEvents& events) {
    return static_cast<int>(std::count_if(
        events.begin(), events.end(), [](const ResultEvent& event) { return std::holds_alternative<Done>(event); }));
}

}  // namespace cimhost
