#pragma once

#include "lab/load/Random.h"
#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost::lab {

/** Whether makeValue() supports a property: a single value of a plain type, a string or a datetime. */
bool canMakeValue(const Property& property);

/** A value of the property's type that survives a round trip: no blanks at its ends, no invalid date. */
Value makeValue(const Property& property, Random& random);

/** Whether two values have the same type and content. */
bool sameValue(const Value& left, const Value& right);

}  // namespace cimhost::lab
