#pragma once

#include <string>
#include <string_view>

#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost {

/**
 * Reads an object path written as an untyped WBEM URI: [//host/][namespace:]Class[.Key=value,...].
 * Values are quoted strings, integers, true and false; a reference is a quoted path. Keys take the types that
 * the class gives them; of a class that the schema does not know, strings, uint64 or sint64, real64 and booleans.
 * Not all keys need be there. PathError when the text is no path, names a key that the class does not have or
 * has it twice, or when a value does not fit its key's type.
 *
 * @param defaultNameSpace for a path, also a referenced one, that names none
 */
ObjectPath parseObjectPath(std::string_view text, const Schema& schema, const std::string& defaultNameSpace);

/** The path as text that parseObjectPath reads back. A null key value, which no path should have, is written NULL. */
std::string formatObjectPath(const ObjectPath& path);

}  // namespace cimhost
