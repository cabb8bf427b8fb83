#pragma once

#include <algorithm>
#include <variant>
#include <vector>

#include "model/ErrorInfo.h"
#include "model/Value.h"

namespace cimhost {

/** A provider's announcement that it returns nothing more. */
struct Done {};

/** One thing that a provider handed to its result: an instance, an object path, data, an error, or that it is done. */
using ResultEvent = std::variant<Instance, ObjectPath, Value, ErrorInfo, Done>;

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
