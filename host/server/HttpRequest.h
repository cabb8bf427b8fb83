#pragma once

#include <map>
#include <optional>
#include <string>
#include <string_view>

#include "cim/Names.h"

namespace cimhost::server {

/** Headers by name; the names ignore letter case. */
using Headers = std::multimap<std::string, std::string, cim::NameLess>;

/** The value of a header; none if it is absent or there several times. */
inline std::optional<std::string> headerIn(const Headers& headers, std::string_view name) {
    const auto found = headers.equal_range(name);
    return headers.count(name) == 1 ? std::optional(found.first->second) : std::nullopt;
}

/** The head of an HTTP request. */
struct HttpRequest {
    std::string method{};
    Headers headers{};
};

/** A response with a short body, or none. */
struct HttpResponse {
    unsigned status = 200;
    Headers headers{};
    std::string body{};
};

}  // namespace cimhost::server
