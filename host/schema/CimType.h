#pragma once

#include <cmpidt.h>

#include <optional>
#include <string_view>

namespace cimhost {

/** Name of a CIM type in MOF, without array brackets; "reference" or "instance" for these. */
std::string_view typeName(CMPIType type);

/** The intrinsic type of this name in MOF, which ignores letter case; none for other names. */
std::optional<CMPIType> intrinsicType(std::string_view name);

/** Whether the type is one of the eight integer types. */
bool isInteger(CMPIType type);

}  // namespace cimhost
