#pragma once

#include "ProviderConnection.h"
#include "gate/cmpi/LocalObjects.h"

#include <cstddef>
#include <vector>

namespace gate {

/** The arguments of a request, which belong to the object manager. */
struct Request {
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    std::size_t generation;  ///< of the request lock when the request began

    bool hasManager() const { return theRequestLock.generation() == generation; }

    /** Throws ManagerGone if the object manager has ended. Called before each of its functions. */
    void requireManager() const {
        if (!hasManager()) {
            throw ManagerGone{};
        }
    }

    /** The object manager's broker, of the latest factory call. Throws ManagerGone if there is none. */
    const CMPIBroker* broker() const;

    /** The same, but null if there is none. */
    const CMPIBroker* brokerOrNull() const;

    /** The path's class. Fails with CMPI_RC_ERR_INVALID_CLASS if the provider does not serve it. */
    const Class& requestedClass() const;

    /**
     * @name Returns the answers to the client and ends
     * Called when all answers exist, so that a request that fails returns none. Fails if the object manager does not
     * accept one.
     */
    ///@{
    void give(const std::vector<const CMPIInstance*>& instances) const;
    void give(const std::vector<const CMPIObjectPath*>& paths) const;
    ///@}
};

/**
 * A request's access to the provider, through the provider's own function tables. Holds the request lock, so no other
 * request runs in the provider, except while the provider or releaseFor() waits for the object manager. Throws
 * ManagerGone if that ends.
 *
 * An object manager may crash while a client's object is read: SFCB does for a string that was sent as an integer.
 * Begin the session before you read a client's keys and values: then no data file is being written.
 *
 * The provider logs its errors and returns success. Where an error is visible, since the answer was not ended, it is a
 * Failure here; a change has to be checked afterwards.
 */
class ProviderSession {
public:
    using Paths = std::vector<const CMPIObjectPath*>;
    using Instances = std::vector<const CMPIInstance*>;

    enum class Access { read, change };

    /** Begins the session. For a change, this process must own the data directory. */
    explicit ProviderSession(const Request& itsRequest, Access access = Access::read);

    const CMPIBroker* broker() const { return request.broker(); }

    Paths names(const LocalObjectPath& classPath) const;
    Instances instances(const LocalObjectPath& classPath) const;
    Paths associatorNames(const LocalObjectPath& path, const Class& association) const;

    /** The instance; null if there is none. */
    const CMPIInstance* find(const LocalObjectPath& path, const Class& owner) const;

    /** The instance. Fails with CMPI_RC_ERR_NOT_FOUND if there is none. */
    const CMPIInstance* get(const LocalObjectPath& path, const Class& owner) const;

    void create(const LocalObjectPath& path);
    void modify(const LocalObjectPath& path, const Values& values);
    void remove(const LocalObjectPath& path);

    /** Marks the provider's tables as wrong: it is loaded again before the next request. */
    void setOutdated() const { theConnection.setOutdated(); }

    /**
     * Releases the lock for a call of the object manager that may take long or lead back to the gate. Another request
     * may load the provider again meanwhile.
     */
    template <class Work>
    void releaseFor(Work work) {
        guard.releaseFor(work);
        theConnection.requireCurrent(guard);
    }

private:
    bool isListed(const LocalObjectPath& path, const Class& owner) const;

    LockGuard guard;
    const Request& request;
};

}  // namespace gate
