#pragma once

#include <optional>
#include <string>
#include <vector>

namespace cimhost {

/** Names of the properties that a request is about; none means all of them, an empty list none of them. */
using PropertyList = std::optional<std::vector<std::string>>;

}  // namespace cimhost
