#pragma once

#include <string>

#include "schema/Literal.h"
#include "schema/Schema.h"

namespace cimhost {

/**
 * The literal as one element of the property's value; a reference is read from a string that holds its path.
 * ValueError or PathError when it does not fit the property's type or the class that a reference points to.
 *
 * @param defaultNameSpace for a reference that names none
 */
Scalar typedElement(const Literal& literal, const Property& property, const Schema& schema,
                    const std::string& defaultNameSpace);

}  // namespace cimhost
