#pragma once

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * Adapter of the computer end of the setting associations. Another provider serves computer systems: the adapter
 * enumerates them through the broker and returns their instances unchanged. The object manager owns the instances and
 * the enumeration, which are valid until the request ends.
 */
class CMPILAWComputerSystem {
public:
    /** Creates an adapter without a current instance. */
    CMPILAWComputerSystem(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                          std::string requestNameSpace);
    ~CMPILAWComputerSystem();
    CMPILAWComputerSystem(const CMPILAWComputerSystem&) = delete;
    CMPILAWComputerSystem& operator=(const CMPILAWComputerSystem&) = delete;

    /**
     * Enumerates the instances of the path's class in its namespace, ignoring its keys, and makes the first one
     * current. If that element is not an instance, there is no current instance. Does not call the broker if the path
     * is null.
     * @throws ProviderException if the path is null, or if the enumeration fails or has no element
     */
    void setObjectPath(const CMPIObjectPath* path);

    /**
     * Returns whether there is an instance after the current one. A loop that checks this first therefore skips the
     * last instance; the associations depend on that.
     */
    operator bool();

    /** Moves to the next instance. If getNext fails, there is no current instance. */
    void operator++();

    /** Returns the path of the current instance; null if there is no instance, or if it does not return its path. */
    CMPIObjectPath* getObjectPath();

    /** Returns the current instance with all properties; null if there is none. */
    CMPIInstance* getCMPIInstance(const char** properties);

private:
    bool hasNext() const;
    bool takeNext();

    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
    CMPIInstance* current = nullptr;
    CMPIEnumeration* enumeration = nullptr;
};

}  // namespace KO::LeaseWarrantyProvider
