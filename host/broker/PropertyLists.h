#pragma once

#include <vector>

#include "model/PropertyList.h"

namespace cimhost {

/** A property list out of C: pointers to names, ended by a null pointer; a null list names all properties. */
PropertyList propertyListFrom(const char** names);

/** A property list for C. What it points to lives as long as it and the list it was made from. */
class CPropertyList {
public:
    explicit CPropertyList(const PropertyList& list);

    /** Null when the list names all properties. */
    const char** get() { return pointers.empty() ? nullptr : pointers.data(); }

private:
    std::vector<const char*> pointers;
};

}  // namespace cimhost
