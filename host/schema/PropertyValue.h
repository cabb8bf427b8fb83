#pragma once

#include <string>
#include <string_view>

#include "schema/Schema.h"

namespace cimhost {

/**
 * Reads a property value from a command line: without quotation marks for strings, datetimes, references and char16; as
 * a literal for other types; as a list in braces, {"a", "b"}, for arrays. Nothing is the empty string and not valid for
 * other types; null cannot be written.
 * @throws ValueError, PathError with the property's name
 */
Value parsePropertyValue(std::string_view source, const Property& property, const Schema& schema,
                         const std::string& defaultNameSpace);

}  // namespace cimhost
