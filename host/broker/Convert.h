#pragma once

#include <cmpidt.h>

#include <vector>

#include "broker/Arena.h"
#include "model/Request.h"
#include "model/Value.h"

namespace cimhost {

/**
 * Converts a CMPI value to a plain value. A null pointer to the value, its object, its array or the characters of its
 * string object results in null.
 * @param value if the type is CMPI_chars, a pointer to the characters
 * @throws Failure with CMPI_RC_ERR_INVALID_DATA_TYPE if the type is not a CIM type, CMPI_RC_ERR_INVALID_PARAMETER if an
 * object does not have the type, CMPI_RC_ERR_TYPE_MISMATCH if the array has elements of another type
 */
Value valueFrom(const CMPIValue* value, CMPIType type);

/** The type without CMPI_ARRAY; CMPI_string for CMPI_chars. @throws Failure if it is not a CIM type */
CMPIType elementType(CMPIType type);

/** Converts a CMPI value that is not an array. */
Scalar scalarFrom(const CMPIValue* value, CMPIType type);

/** Converts a value to CMPI data, whose objects are created in the arena. */
CMPIData dataFrom(const Value& value, Arena& arena);

/** Converts one value of this type. */
CMPIData dataFrom(const Scalar& scalar, CMPIType type, Arena& arena);

/** Converts a C property list: pointers to names, terminated by a null pointer. A null list means all properties. */
PropertyList propertyListFrom(const char** names);

/** A C property list. The list that it was constructed from must outlive it. */
class CPropertyList {
public:
    explicit CPropertyList(const PropertyList& list);

    /** Null if the list means all properties. */
    const char** get() { return pointers.empty() ? nullptr : pointers.data(); }

private:
    std::vector<const char*> pointers;
};

}  // namespace cimhost
