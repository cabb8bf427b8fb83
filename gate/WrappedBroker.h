#pragma once

#include <cmpift.h>

namespace gate {

/**
 * The broker that the provider is given: every call goes on to the object manager's broker, with the object manager's
 * own pointer, since managers keep more behind it than this structure says. While the provider waits for one of the
 * broker's services, such as an operation on another class, others have their turn.
 *
 * What the object manager lacks is lacking here. So are the messages with a variable number of arguments, which
 * cannot be passed on and which the provider does not use.
 */
class WrappedBroker {
public:
    explicit WrappedBroker(const CMPIBroker* manager);
    WrappedBroker(const WrappedBroker&) = delete;
    WrappedBroker& operator=(const WrappedBroker&) = delete;

    const CMPIBroker* handle() const { return &broker; }

    /** The object manager's broker. */
    const CMPIBroker* manager() const { return managersOwn; }

    /** @name Paths and instances that could not be made
     * The provider leaves such answers out without a word. Noted since the last forgetFailures().
     */
    ///@{
    void noteFailure() { failed = true; }
    void forgetFailures() { failed = false; }
    bool hasFailed() const { return failed; }
    ///@}

private:
    CMPIBrokerFT services;
    CMPIBrokerEncFT encapsulation;
    CMPIBrokerMemFT memory;
    CMPIBroker broker;
    const CMPIBroker* managersOwn;
    bool failed = false;
};

}  // namespace gate
