#pragma once

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * The computer end of the setting associations. Computer systems are served by another provider: the
 * adapter asks the object manager for their instances, walks them, and hands them out unchanged.
 * They belong to the object manager, like the enumeration, and live until the request ends.
 */
class CMPILAWComputerSystem {
public:
    /** Stands on no instance until setObjectPath. */
    CMPILAWComputerSystem(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                          std::string requestNameSpace);
    ~CMPILAWComputerSystem();
    CMPILAWComputerSystem(const CMPILAWComputerSystem&) = delete;
    CMPILAWComputerSystem& operator=(const CMPILAWComputerSystem&) = delete;

    /**
     * Has the instances of the path's class enumerated, in its namespace and without regard to its
     * keys, and stands on the first. Throws ProviderException when there is none to be had, also for a
     * null path, which the object manager is not asked about. Stands on none when what comes first is no
     * instance.
     */
    void setObjectPath(const CMPIObjectPath* path);

    /**
     * Whether a further instance waits behind the current one. A loop that tests this before using
     * the current instance therefore never sees the last one; the associations are built on that.
     */
    operator bool();

    /** Moves to the next instance; to none when that cannot be had. */
    void operator++();

    /** Path of the current instance; null when there is none or it does not tell. */
    CMPIObjectPath* getObjectPath();

    /** The current instance, with all its properties; null when there is none. */
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
