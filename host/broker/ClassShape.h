#pragma once

#include <cmpidt.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace cimhost {

/** What the broker needs to know of a property. */
struct PropertyShape {
    std::string name{};
    CMPIType type = CMPI_null;  ///< element type, without CMPI_ARRAY
    bool isArray = false;
    bool isKey = false;
    std::string referenceClass{};  ///< of a reference, the class that it refers to; empty otherwise
};

/** What the broker needs to know of a class: all its properties, inherited ones too, and what it descends from. */
struct ClassShape {
    std::string name{};
    std::vector<PropertyShape> properties{};
    std::vector<std::string> superclasses{};  ///< names, the direct superclass first
};

/** Gives the shape of the class of that name, in any letter case, or null for a class that is not known. */
using ClassShapeLookup = std::function<std::shared_ptr<const ClassShape>(const std::string& className)>;

}  // namespace cimhost
