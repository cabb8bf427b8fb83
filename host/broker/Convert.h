#pragma once

#include <cmpidt.h>

#include <vector>

#include "broker/Arena.h"
#include "model/Request.h"
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

/** Reads a property list in C: pointers to names, ended by a null pointer; a null list names all properties. */
PropertyList propertyListFrom(const char** names);

/** A property list in C. It points into the list that it was made from, which must outlive it. */
class CPropertyList {
public:
    explicit CPropertyList(const PropertyList& list);

    /** Null when the list names all properties. */
    const char** get() { return pointers.empty() ? nullptr : pointers.data(); }

private:
    std::vector<const char*> pointers;
};

}  // namespace cimhost
