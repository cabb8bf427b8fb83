#pragma once

#include <string>
#include <vector>

#include "cli/Style.h"

namespace cimhost::text {

using Row = std::vector<std::string>;

/**
 * The rows with their columns under each other; nothing is filled up after the last column. What is too wide for the
 * style's width goes on below, under the last column; where there is no room for that, each cell has a line of its own.
 * @param roles of the columns, from the first; those left out are plain
 */
std::string aligned(const std::vector<Row>& rows, const std::string& indent, const Style& style = {},
                    const std::vector<Role>& roles = {});

}  // namespace cimhost::text
