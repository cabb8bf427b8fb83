#pragma once

#include <string>

#include "model/Value.h"

namespace cimhost {

/**
 * The instance as MOF text, "instance of Class { ... };" with every property in order and a line feed at the end. Bytes
 * that are no UTF-8 become replacement characters. Of a long text each 1,000 bytes or so are a literal of their own:
 * some compilers have no room for more.
 */
std::string formatMof(const Instance& instance);

/** The value as the right side of a MOF assignment: a constant, NULL, or {a, b} for an array. Each text in one piece.
 */
std::string formatMof(const Value& value);

}  // namespace cimhost
