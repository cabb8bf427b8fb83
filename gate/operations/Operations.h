#pragma once

#include <string_view>
#include <vector>

#include "gate/session/ProviderSession.h"

// The operations of CIM, and their property lists. Each returns its results through the request's result, or throws
// Failure or ManagerGone.
//
// An operation begins its session before it reads a client's keys and values, and returns its results after the
// session, so that a slow client does not block others. Only a creation returns its path within the session.

namespace gate {

/** Fails with CMPI_RC_ERR_NO_SUCH_PROPERTY unless the class has a property of that name. */
void requireProperty(const Class& requested, std::string_view name);

/** The properties of a class that a client asks for or sends; without a list, all. Names ignore letter case. */
class PropertySelection {
public:
    /** @param list names, ended by a null pointer; null for none */
    PropertySelection(const char** list, const Class& itsClass);

    bool has(const Property& property) const;

    /** Fails with CMPI_RC_ERR_NO_SUCH_PROPERTY if a name on the list is not a property of the class. */
    void requireKnown() const;

    /** The instance with its keys and the selected properties: itself, or a new one if some are not selected. */
    const CMPIInstance* applied(const CMPIBroker* broker, const CMPIInstance* instance) const;

private:
    const Class& requested;
    std::vector<const char*> names{};
    bool isComplete;  ///< whether it has all properties of the class
};

void enumerateInstanceNames(const ClientRequest& request);
void enumerateInstances(const ClientRequest& request, const char** properties);
void getInstance(const ClientRequest& request, const char** properties);

void createInstance(const ClientRequest& request, const CMPIInstance* instance);
void modifyInstance(const ClientRequest& request, const CMPIInstance* instance, const char** properties);
void deleteInstance(const ClientRequest& request);

/** Traversals of associations, from the request's path. References ignore the property list. */
void associators(const ClientRequest& request, const char* associationClass, const char* resultClass, const char* role,
                 const char* resultRole, const char** properties);
void associatorNames(const ClientRequest& request, const char* associationClass, const char* resultClass,
                     const char* role, const char* resultRole);
void references(const ClientRequest& request, const char* associationClass, const char* role, const char** properties);
void referenceNames(const ClientRequest& request, const char* associationClass, const char* role);

/** The results of reads of an association class. */
Paths associationPaths(const ClientRequest& request, const Class& association);
Instances associationInstances(const ClientRequest& request, const Class& association);
const CMPIInstance* associationAt(const ClientRequest& request, const Class& association);

}  // namespace gate
