#pragma once

#include <cmpidt.h>

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <type_traits>
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

/** A call to returnDone. */
struct Done {};

/** A null pointer that a provider returned as an instance, an object path or an error. The result rejects it. */
struct NullResult {};

/**
 * One call to a result function: the instance, object path, data, error or null pointer that the provider returned, or
 * Done. The owner of an event can change its instance or path if nothing else refers to it.
 */
using ResultEvent = std::variant<std::shared_ptr<Instance>, std::shared_ptr<ObjectPath>, Value,
                                 std::shared_ptr<const ErrorInfo>, NullResult, Done>;

/** The results of a provider, in the order of its calls, each as it was at the time of the call. */
using ResultEvents = std::vector<ResultEvent>;

/** The alternative of ResultEvent for a result of this kind. */
template <class Kind>
struct AlternativeFor {
    using Type = Kind;
};
template <>
struct AlternativeFor<Instance> {
    using Type = std::shared_ptr<Instance>;
};
template <>
struct AlternativeFor<ObjectPath> {
    using Type = std::shared_ptr<ObjectPath>;
};
template <>
struct AlternativeFor<ErrorInfo> {
    using Type = std::shared_ptr<const ErrorInfo>;
};

/** The result of an event; null if the event is of another kind. */
template <class Kind>
const Kind* resultOf(const ResultEvent& event) {
    const auto* alternative = std::get_if<typename AlternativeFor<Kind>::Type>(&event);
    if constexpr (std::is_same_v<typename AlternativeFor<Kind>::Type, Kind>) {
        return alternative;
    } else {
        return alternative == nullptr ? nullptr : alternative->get();
    }
}

/** All events of one kind, in order. */
template <class Kind>
std::vector<Kind> eventsOf(const ResultEvents& events) {
    std::vector<Kind> found;
    for (const ResultEvent& event : events) {
        if (const Kind* one = resultOf<Kind>(event)) {
            found.push_back(*one);
        }
    }
    return found;
}

/** Number of calls to returnDone. */
inline int doneCount(const ResultEvents& events) {
    return static_cast<int>(std::count_if(
        events.begin(), events.end(), [](const ResultEvent& event) { return std::holds_alternative<Done>(event); }));
}

}  // namespace cimhost
