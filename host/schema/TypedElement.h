#pragma once

#include <string>

#include "schema/Literal.h"
#include "schema/Schema.h"

namespace cimhost {

/**
 * Converts a literal to an element of a property's value. The literal of a reference is a string with its path.
 *
 * @param defaultNameSpace of a reference without a namespace
 * @throws ValueError, PathError if it does not match the property's type or the class of the reference
 */
Scalar typedElement(const Literal& literal, const Property& property, const Schema& schema,
                    const std::string& defaultNameSpace);

}  // namespace cimhost
