#pragma once

#include <string>

#include "cli/TextLayout.h"
#include "lab/load/Report.h"

// The report of a load as text and as JSON; README.md shows both.

namespace cimhost::text {

std::string format(const lab::Report& report, const Style& style);

}  // namespace cimhost::text

namespace cimhost::json {

std::string format(const lab::Report& report);

}  // namespace cimhost::json
