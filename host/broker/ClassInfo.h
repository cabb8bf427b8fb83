#pragma once

#include <cmpidt.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace cimhost {

class Schema;

/** A property as the broker needs it. */
struct PropertyInfo {
    std::string name{};
    CMPIType type = CMPI_null;  ///< element type, without CMPI_ARRAY
    bool isArray = false;
    bool isKey = false;
    std::string referenceClass{};  ///< of a reference, the class that it refers to; empty otherwise
};

/** A class as the broker needs it: all properties, also inherited ones, and superclasses. */
struct ClassInfo {
    std::string name{};
    std::vector<PropertyInfo> properties{};
    std::vector<std::string> superclasses{};  ///< names, the direct superclass first
};

/** Returns the class of that name, in any letter case; null for an unknown class. */
using ClassInfoLookup = std::function<std::shared_ptr<const ClassInfo>(const std::string& className)>;

/** A lookup of the schema's classes, which does not refer to the schema afterwards. */
ClassInfoLookup classInfos(const Schema& schema);

}  // namespace cimhost
