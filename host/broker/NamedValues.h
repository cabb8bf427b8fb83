#pragma once

#include <cmpidt.h>

#include <string_view>
#include <vector>

#include "broker/Arena.h"
#include "model/Value.h"

// Lists of named values: keys, properties, arguments, context entries. Names ignore letter case.

namespace cimhost {

/** The value of that name; null when there is none. */
const NamedValue* findNamed(const std::vector<NamedValue>& values, std::string_view name);

/** Replaces the value of that name in its place, or appends it. */
void setNamed(std::vector<NamedValue>& values, std::string_view name, Value value);

/** The value of that name as CMPI data. Failure with CMPI_RC_ERR_NO_SUCH_PROPERTY when there is none. */
CMPIData namedData(const std::vector<NamedValue>& values, const char* name, Arena& arena);

/** The value at that position; *name, unless name is null, receives its name. Failure as above. */
CMPIData namedDataAt(const std::vector<NamedValue>& values, CMPICount index, CMPIString** name, Arena& arena);

}  // namespace cimhost
