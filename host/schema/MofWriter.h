#pragma once

#include <string>

#include "model/Value.h"

namespace cimhost {

/**
 * The instance as MOF text, "instance of Class { ... };" with every property in order and a line feed at the end. Bytes
 * that are no UTF-8 become replacement characters.
 */
std::string formatMof(const Instance& instance);

/** The value as the right side of a MOF assignment: a constant, NULL, or {a, b} for an array. */
std::string formatMof(const Value& value);

}  // namespace cimhost
