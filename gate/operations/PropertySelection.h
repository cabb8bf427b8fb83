#pragma once

#include <vector>

#include "gate/session/ProviderSession.h"

namespace gate {

/** The properties of a class that a client asks for or sends; without a list, all. Names ignore letter case. */
class PropertySelection {
public:
    /** @param list names, ended by a null pointer; null for none */
    PropertySelection(const char** list, const Class& itsClass);

    /** Whether there is a list, so that the client has chosen the properties on it. */
    bool isListed() const { return hasList; }

    bool has(const Property& property) const;

    /** Fails with CMPI_RC_ERR_NO_SUCH_PROPERTY if a name on the list is not a property of the class. */
    void requireKnown() const;

    /** The instance with its keys and the selected properties: itself, or a new one if some are not selected. */
    const CMPIInstance* applied(const CMPIBroker* broker, const CMPIInstance* instance) const;

private:
    const Class& owner;
    bool hasList;
    std::vector<const char*> names{};
    bool isComplete;  ///< whether it has all properties of the class
};

}  // namespace gate
