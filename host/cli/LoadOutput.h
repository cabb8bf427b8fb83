#pragma once

#include <string>

#include "cli/Style.h"
#include "load/Report.h"

// The report of a load, for people and for programs; docs/cimhost.md shows both.

namespace cimhost::text {

std::string format(const load::Report& report, const Style& style);

}  // namespace cimhost::text

namespace cimhost::json {

std::string format(const load::Report& report);

}  // namespace cimhost::json
