#pragma once

#include <cmpidt.h>

#include <string>
#include <string_view>
#include <vector>

#include "broker/Arena.h"
#include "cim/Names.h"
#include "model/Value.h"

// Lists of named values: keys, properties, arguments, context entries. Names are case-insensitive.

namespace cimhost {

using cim::findNamed;

/** Replaces the value of this name, or appends one. */
void setNamed(std::vector<NamedValue>& values, std::string_view name, Value&& value);

/** The value of this name as CMPI data. @throws Failure with CMPI_RC_ERR_NO_SUCH_PROPERTY if there is none */
CMPIData namedData(const std::vector<NamedValue>& values, const char* name, Arena& arena);

/** The value at this position. @param name receives its name; can be null  @throws Failure as namedData() */
CMPIData namedDataAt(const std::vector<NamedValue>& values, CMPICount index, CMPIString** name, Arena& arena);

}  // namespace cimhost
