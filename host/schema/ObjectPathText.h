#pragma once

#include <string>
#include <string_view>

#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost {

/**
 * Reads an untyped WBEM URI: [//host/][namespace:]Class[.Key=value,...]. Values are quoted strings, numbers, true and
 * false; a reference is a quoted path. Keys have the types that the class declares; those of an unknown class are
 * strings, uint64 or (negative) sint64, real64 and booleans. Keys may be missing.
 *
 * @param defaultNameSpace of paths, and of references, without a namespace
 * @throws PathError if the string is not a path, the class does not have a key, a key occurs twice, or a value does not
 * match its key's type
 */
ObjectPath parseObjectPath(std::string_view uri, const Schema& schema, const std::string& defaultNameSpace);

/** Formats a path as parseObjectPath() reads it. A null key value, which is not valid, is written as NULL. */
std::string formatObjectPath(const ObjectPath& path);

}  // namespace cimhost
