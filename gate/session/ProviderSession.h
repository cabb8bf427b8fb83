#pragma once

#include <cstddef>
#include <vector>

#include "ProviderConnection.h"
#include "gate/cmpi/Objects.h"

namespace gate {

using Instances = std::vector<const CMPIInstance*>;
using Paths = std::vector<const CMPIObjectPath*>;

/** The arguments of a client's request, which belong to the object manager. */
struct ClientRequest {
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    std::size_t generation = theRequestLock.generation();  ///< when the request began

    bool hasManager() const { return theRequestLock.generation() == generation; }

    /** Throws ManagerGone if the object manager has ended. Then none of its functions must be called. */
    void requireManager() const { ManagerGone::throwUnless(hasManager()); }

    /** The broker that the latest factory call received. Throws ManagerGone if there is none. */
    const CMPIBroker* broker() const;

    /** The same broker, but null if there is none. */
    const CMPIBroker* brokerOrNull() const { return hasManager() ? theConnection.broker() : nullptr; }

    /** The path's class. Fails with CMPI_RC_ERR_INVALID_CLASS if the provider does not serve it. */
    const Class& requestedClass() const;

    /**
     * Returns the results to the client and ends the response. Call it when all results exist, so that a request that
     * fails returns none. Fails if the object manager does not accept a result.
     */
    void returnResults(const Instances& instances) const;
    void returnResults(const Paths& paths) const;
};

/**
 * A request's access to the provider, through the provider's own function tables. Each function except releaseFor()
 * sends a request to the provider. Holds the request lock, so that no other request runs in the provider, except while
 * the provider or releaseFor() waits for the object manager. Throws ManagerGone if the object manager ends.
 *
 * An object manager may crash while a client's object is read: SFCB does if the client sent a string for an integer.
 * Begin the session before you read a client's keys and values, so that no data file is being written.
 *
 * The provider logs its errors and returns success. The session throws Failure if a response was not ended, or if the
 * provider has not read all records of the file. The caller has to check the result of a change.
 */
class ProviderSession {
public:
    enum class Access { read, change };

    /** Begins the session. For a change, this process must own the data directory. */
    explicit ProviderSession(const ClientRequest& itsRequest, Access access = Access::read);

    /** All instances of a class, in the request's namespace. */
    Paths names(const Class& requested) const;
    Instances instances(const Class& requested) const;

    /** The leases or warranties of the computer with these keys. */
    Paths associatorNames(const LocalObject& computer, const Class& association) const;
    Instances associators(const LocalObject& computer, const Class& association) const;

    /** The instance with the keys; null if there is none. */
    const CMPIInstance* find(const LocalObject& keys, const Class& requested) const;

    /** The instance with the keys. Fails with CMPI_RC_ERR_NOT_FOUND if there is none. */
    const CMPIInstance* get(const LocalObject& keys, const Class& requested) const;

    /** Creates an instance with default values and returns it. Fails if there is an instance with the keys. */
    const CMPIInstance* create(const LocalObject& keys);
    void modify(const LocalObject& keys, const LocalObject& values);
    void remove(const LocalObject& keys);

    /**
     * Releases the lock during a call to the object manager, which may take a long time or call the gate again. Another
     * request may load the provider again meanwhile.
     */
    template <class Work>
    void releaseFor(Work work) {
        guard.releaseFor(work);
        theConnection.requireCurrent(guard, isReading);
    }

private:
    void requireRead(const Class& requested) const;

    LockGuard guard;
    const ClientRequest& request;
    bool isReading;
};

}  // namespace gate
