#pragma once

#include <cmpidt.h>

#include <cstddef>
#include <string_view>

#include "cim/Names.h"

namespace gate {

using cim::sameName;

/** A property or reference of a class. */
struct Property {
    const char* name;
    CMPIType type;
    bool isKey;
    bool isWritable;
    const char* referenceClass;  ///< the class that a reference refers to; null for a property
};

/** A class as the MOF declares it. */
struct Class {
    const char* name;
    bool isAssociation;
    const Property* properties;
    std::size_t propertyCount;

    const Property* begin() const { return properties; }
    const Property* end() const { return properties + propertyCount; }
};

/** All classes. The table is generated from the MOF when the library is built. */
struct Classes {
    const Class* begin() const;
    const Class* end() const;
};

/** The class of computers, which another provider serves. Each association has a computer at one end. */
constexpr const char* computerClass = "VELKO_ComputerSystem";

/** The class whose only instance is the agent. */
constexpr const char* agentClass = "VELKO_OstrelAgent";

/** The class with this name; null if the MOF declares none. */
inline const Class* findClass(std::string_view name) {
    const Classes classes{};
    return cim::findNamed(classes, name);
}

}  // namespace gate
