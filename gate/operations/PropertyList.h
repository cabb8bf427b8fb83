#pragma once

#include "gate/session/ProviderSession.h"

namespace gate {

/** The properties of a class that a client asks for or sends; null for all. Names ignore letter case. */
class PropertyList {
public:
    PropertyList(const char** listed, const Class& itsClass);

    /** Whether there is a list, so that the client has chosen the properties on it. */
    bool isGiven() const { return names != nullptr; }

    bool has(const Property& property) const;

    /** Fails with CMPI_RC_ERR_NO_SUCH_PROPERTY if a name on the list is not a property of the class. */
    void requireKnown() const;

    /** The instance with its keys and the listed properties: itself, or a new one if some are not listed. */
    const CMPIInstance* applied(const CMPIBroker* broker, const CMPIInstance* instance) const;

private:
    const char** names;
    const Class& owner;
    bool isComplete;  ///< whether it has all properties of the class
};

}  // namespace gate
