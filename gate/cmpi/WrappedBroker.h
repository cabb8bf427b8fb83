#pragma once

#include <cmpift.h>

namespace gate {

/**
 * The broker that the provider receives. It forwards every call to the object manager's broker, with the manager's own
 * pointer, since managers keep more data behind it than the structure declares. A service of the manager, such as an
 * operation on another class, may lead back to the gate, so the lock is released for it.
 *
 * Functions that the manager lacks are lacking here, too. So are the messages with a variable number of arguments,
 * which cannot be forwarded and which the provider does not use.
 */
class WrappedBroker {
public:
    /** The functions of a lock that the caller holds, and that is released during the manager's services. */
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
