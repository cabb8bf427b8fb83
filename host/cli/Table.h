#pragma once

#include <string>
#include <vector>

namespace cimhost::text {

using Row = std::vector<std::string>;

/** The rows with their columns under each other; nothing is filled up after the last column. */
std::string aligned(const std::vector<Row>& rows, const std::string& indent);

}  // namespace cimhost::text
