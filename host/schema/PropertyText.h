#pragma once

#include <string>
#include <string_view>

#include "schema/Schema.h"

namespace cimhost {

/**
 * The value that a person writes for a property, NAME=VALUE: the text itself for strings, datetimes, references
 * and single characters, a constant for the other types, a list in braces for an array, {"a", "b"}. An empty
 * text is the empty string and no value of any other type; null cannot be written.
 * ValueError or PathError, with the property's name, when the text does not fit.
 */
Value parsePropertyText(std::string_view text, const Property& property, const Schema& schema,
                        const std::string& defaultNameSpace);

}  // namespace cimhost
