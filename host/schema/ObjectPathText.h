#pragma once

#include <string>
#include <string_view>

#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost {

/**
 * Reads an untyped WBEM URI: [//host/][namespace:]Class[.Key=value,...]. Values are strings in quotation marks,
 * characters in apostrophes, numbers, true and false. The value of a reference is a path in quotation marks. Keys have
 * the types that the class declares; a key of an unknown class has the literalType(). Keys can be missing.
 *
 * @param defaultNameSpace the namespace of a path or a reference that does not name one
 * @throws PathError if the string is not a path, the class does not have a key, a key occurs twice or is null, or a
 * value does not match its key's type
 */
ObjectPath parseObjectPath(std::string_view uri, const Schema& schema, const std::string& defaultNameSpace);

/** Formats a path so that parseObjectPath() can read it. A null key value, which is not valid, is written as NULL. */
std::string formatObjectPath(const ObjectPath& path);

}  // namespace cimhost
