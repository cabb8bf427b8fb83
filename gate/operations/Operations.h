#pragma once

#include <string_view>
#include <vector>

#include "gate/session/ProviderSession.h"

// The CIM operations and their property lists. Each operation returns its results through the request's CMPIResult, or
// throws Failure or ManagerGone.
//
// An operation begins its session before it reads a client's keys and values. It returns its results after the session,
// so that a slow client does not block other requests. Only a creation returns its path within the session.

namespace gate {

/** Fails with CMPI_RC_ERR_NO_SUCH_PROPERTY unless the class has a property of that name. */
void requireProperty(const Class& requested, std::string_view name);

/** The properties of a class that a client requests or sends; without a list, all. Names ignore letter case. */
class PropertySelection {
public:
    /** @param list property names, ended by a null pointer; null if there is no list */
    PropertySelection(const char** list, const Class& itsClass);

    bool has(const Property& property) const;

    /** Fails with CMPI_RC_ERR_NO_SUCH_PROPERTY if a name on the list is not a property of the class. */
    void requireKnown() const;

    /** Returns the instance if all properties are selected, otherwise a copy with its keys and selected properties. */
    const CMPIInstance* applied(const CMPIBroker* broker, const CMPIInstance* instance) const;

private:
    const Class& requested;
    std::vector<const char*> names{};
    bool isComplete;  ///< whether all properties of the class are selected
};

void enumerateInstanceNames(const ClientRequest& request);
void enumerateInstances(const ClientRequest& request, const char** properties);
void getInstance(const ClientRequest& request, const char** properties);

void createInstance(const ClientRequest& request, const CMPIInstance* instance);
void modifyInstance(const ClientRequest& request, const CMPIInstance* instance, const char** properties);
void deleteInstance(const ClientRequest& request);

/** Operations that follow associations from the request's path. references() ignores the property list. */
void associators(const ClientRequest& request, const char* associationClass, const char* resultClass, const char* role,
                 const char* resultRole, const char** properties);
void associatorNames(const ClientRequest& request, const char* associationClass, const char* resultClass,
                     const char* role, const char* resultRole);
void references(const ClientRequest& request, const char* associationClass, const char* role, const char** properties);
void referenceNames(const ClientRequest& request, const char* associationClass, const char* role);

/** The paths or instances of an association class, and the instance that has the request's path. */
Paths associationPaths(const ClientRequest& request, const Class& association);
Instances associationInstances(const ClientRequest& request, const Class& association);
const CMPIInstance* associationAt(const ClientRequest& request, const Class& association);

}  // namespace gate
