#pragma once

#include <algorithm>
#include <variant>
#include <vector>

#include "model/ErrorInfo.h"
#include "model/Value.h"

namespace cimhost {

/** A provider's announcement that it returns nothing more. */
struct Done {};

/** A null pointer that a provider returned as an instance, an object path or an error. The result refused it. */
struct NullResult {};

/** What a provider passed to its result: an instance, an object path, data, an error, null, or that it is done. */
using ResultEvent = std::variant<Instance, ObjectPath, Value, ErrorInfo, NullResult, Done>;

/** What a provider returned, in order, each as it was at the time of the call. */
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

/** How often the provider said that it was done. */
inline int doneCount(const ResultEvents& events) {
    return static_cast<int>(std::count_if(
        events.begin(), events.end(), [](const ResultEvent& event) { return std::holds_alternative<Done>(event); }));
}

}  // namespace cimhost
