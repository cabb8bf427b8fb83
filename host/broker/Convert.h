#pragma once

#include <cmpidt.h>

#include <vector>

#include "broker/Arena.h"
#include "model/Request.h"
#include "model/Value.h"

namespace cimhost {

/**
 * Converts a CMPI value to a plain value. A null pointer, also in a string object or an array, results in null.
 * @param value for CMPI_chars, the characters themselves
 * @throws Failure with CMPI_RC_ERR_INVALID_DATA_TYPE if the type is not a CIM type, CMPI_RC_ERR_INVALID_PARAMETER if an
 * object does not have the type, CMPI_RC_ERR_TYPE_MISMATCH if the array has elements of another type
 */
Value valueFrom(const CMPIValue* value, CMPIType type);

/** The type without CMPI_ARRAY; CMPI_string for CMPI_chars. @throws Failure as valueFrom() */
CMPIType elementType(CMPIType type);

/** Converts a CMPI value that is not an array. */
Scalar scalarFrom(const CMPIValue* value, CMPIType type);

/** Converts a value to CMPI data, whose objects are created in the arena. */
CMPIData dataFrom(const Value& value, Arena& arena);

/** Converts one element. */
CMPIData dataFrom(const Scalar& scalar, CMPIType type, Arena& arena);

/** Converts a C property list: pointers to names, terminated by a null pointer. A null list means all properties. */
PropertyList propertyListFrom(const char** names);

/** A C property list. It refers to the list that it was constructed from. */
class CPropertyList {
public:
    explicit CPropertyList(const PropertyList& list);

    /** Null if the list means all properties. */
    const char** get() { return pointers.empty() ? nullptr : pointers.data(); }

private:
    std::vector<const char*> pointers;
};

}  // namespace cimhost
