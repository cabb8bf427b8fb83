#pragma once

#include <iterator>
#include <optional>
#include <string>
#include <unordered_map>

#include "cim/Names.h"

namespace cimhost::server {

/** Headers by name. Letter case in names is ignored. */
using Headers = std::unordered_multimap<std::string, std::string, cim::NameHash, cim::NameEqual>;

/** The value of a header; none if it is absent or repeated. */
inline std::optional<std::string> headerIn(const Headers& headers, const std::string& name) {
    const auto [first, end] = headers.equal_range(name);
    return first != end && std::next(first) == end ? std::optional(first->second) : std::nullopt;
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
