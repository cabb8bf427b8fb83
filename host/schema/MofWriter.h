#pragma once

#include <string>

#include "model/Value.h"

namespace cimhost {

/**
 * Formats an instance as MOF, "instance of Class { ... };" with all properties in order and a line feed at the end.
 * Bytes that are not UTF-8 become U+FFFD. A string of more than about 1,000 bytes is written as several literals, since
 * some compilers limit the length of a literal.
 */
std::string formatMof(const Instance& instance);

/** Formats a value as in a MOF assignment: a constant, NULL, or {a, b} for an array. Each string is one literal. */
std::string formatMof(const Value& value);

}  // namespace cimhost
