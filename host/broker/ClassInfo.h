#pragma once

#include <cmpidt.h>

#include <atomic>
#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "model/Value.h"

namespace cimhost {

class Schema;

/** The part of a property's declaration that the broker uses. */
struct PropertyInfo {
    Name name{};
    CMPIType type = CMPI_null;  ///< element type, without CMPI_ARRAY
    bool isArray = false;
    bool isKey = false;
    std::string referenceClass{};  ///< of a reference, the class that it refers to; empty otherwise
};

/** The part of a class's declaration that the broker uses, with inherited properties and indirect superclasses. */
struct ClassInfo {
    std::string name{};
    std::vector<PropertyInfo> properties{};
    std::vector<std::string> superclasses{};  ///< names, the direct superclass first

    /** The number of properties of the last instance that a provider returned; the next usually has as many. */
    mutable std::atomic<std::size_t> usualCount{0};
};

/** Returns the class of a case-insensitive name; null for an unknown class. */
using ClassInfoLookup = std::function<std::shared_ptr<const ClassInfo>(const std::string& className)>;

/** Returns a lookup of a schema's classes. The lookup does not refer to the schema. */
ClassInfoLookup classInfos(const Schema& schema);

}  // namespace cimhost
