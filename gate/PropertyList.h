#pragma once

#include "Request.h"
#include "Schema.h"

#include <cmpift.h>

#include <vector>

namespace gate {

/** The properties that a client asks for, or means; null for all. Names ignore letter case. */
class PropertyList {
public:
    explicit PropertyList(const char** listed) : names(listed) {}

    /** Whether there is a list, so that what is on it was chosen. */
    bool isGiven() const { return names != nullptr; }

    bool has(const Property& property) const;

    /** Whether every property of the class is on it. Looks once a class: it is asked for each instance. */
    bool hasAll(const Class& owner) const;

    /** CMPI_RC_ERR_NO_SUCH_PROPERTY when it has a name that the class does not know. */
    void requireKnown(const Class& owner) const;

    /** The instance with its keys and what is on the list: itself, or a new one when something has to go. */
    const CMPIInstance* applied(const Request& request, const CMPIInstance* instance, const Class& owner) const;

    /** The same for each of the instances, all of one class. */
    void apply(const Request& request, std::vector<const CMPIInstance*>& instances, const Class& owner) const;

private:
    const char** names;
    mutable const Class* lookedAt = nullptr;
    mutable bool isWhole = false;  ///< of that class
};

}  // namespace gate
