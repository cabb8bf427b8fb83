#pragma once

#include <cmpidt.h>

#include <optional>
#include <string_view>

namespace cimhost {

/** MOF's name of a CIM type without its array mark; "reference" and "instance" for the encapsulated ones. */
std::string_view typeName(CMPIType type);

/** The intrinsic type that MOF calls so, in any letter case; none for another word. References have no such word. */
std::optional<CMPIType> intrinsicType(std::string_view name);

/** Whether the type is one of the eight integer types. */
bool isInteger(CMPIType type);

}  // namespace cimhost
