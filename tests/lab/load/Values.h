#pragma once

#include "lab/load/Random.h"
#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost::lab {

/** Whether there are values for the property: of a plain type, text or datetime, and no array. */
bool canMakeValue(const Property& property);

/** Some value of the property's type that any store gives back as it is: no odd blanks, no date that does not exist. */
Value makeValue(const Property& property, Random& random);

/** Whether two values are the same, type and all. */
bool sameValue(const Value& left, const Value& right);

}  // namespace cimhost::lab
