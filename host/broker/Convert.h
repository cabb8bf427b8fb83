#pragma once

#include <cmpidt.h>

#include "broker/Arena.h"
#include "model/Value.h"

namespace cimhost {

/**
 * The plain value that a CMPI value is, copied. Null pointers, also inside, give a null value of that type.
 * Characters (CMPI_chars) come as the pointer itself and become a string. Failure with
 * CMPI_RC_ERR_INVALID_DATA_TYPE for a type that is no CIM type, CMPI_RC_ERR_INVALID_PARAMETER for an object that
 * is not of that type, CMPI_RC_ERR_TYPE_MISMATCH for an array of other elements.
 */
Value valueFrom(const CMPIValue* value, CMPIType type);

/** The CIM type that values given with this type have, without CMPI_ARRAY: a string for characters. Failure as above.
 */
CMPIType elementType(CMPIType type);

/** One element of valueFrom()'s: of a plain type, null if the pointer is null. */
Scalar scalarFrom(const CMPIValue* value, CMPIType type);

/** The value as CMPI data; objects in it are made in the arena. */
CMPIData dataFrom(const Value& value, Arena& arena);

/** One element as CMPI data. */
CMPIData dataFrom(const Scalar& scalar, CMPIType type, Arena& arena);

}  // namespace cimhost
