#pragma once

#include <cmpift.h>

namespace gate {

/**
 * The broker that the provider receives. It forwards every call with a pointer to the object manager's own broker, in
 * which managers keep more data than the structure declares. A service of the manager, such as an operation on another
 * class, may call the gate again, so the lock is released during services.
 *
 * It lacks the functions that the manager lacks, and the message functions with a variable number of arguments, which
 * cannot be forwarded and which the provider does not call.
 */
class WrappedBroker {
public:
    /** The functions of a lock that the caller holds. The lock is released during the manager's services. */
    struct Lock {
        void (*release)();
        void (*reacquire)();
    };

    WrappedBroker(const CMPIBroker* itsManager, const Lock& itsLock);
    WrappedBroker(const WrappedBroker&) = delete;
    WrappedBroker& operator=(const WrappedBroker&) = delete;

    const CMPIBroker* handle() const { return &broker; }

    const CMPIBroker* const manager;  ///< the object manager's broker
    const Lock lock;

    /** Whether a path or instance could not be created. The provider omits such objects without an error. */
    bool hasFailed = false;

private:
    CMPIBrokerFT services;
    CMPIBrokerEncFT encapsulation;
    CMPIBrokerMemFT memory;
    CMPIBroker broker;
};

}  // namespace gate
