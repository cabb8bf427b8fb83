#pragma once

#include <array>
#include <cstddef>
#include <mutex>
#include <optional>

#include "ProviderLibrary.h"
#include "RequestLock.h"
#include "durable/RecordFile.h"
#include "gate/cmpi/Schema.h"
#include "gate/cmpi/WrappedBroker.h"

namespace gate {

/** The process's only connection between the provider and an object manager. Loads and unloads the provider. */
class ProviderConnection {
public:
    constexpr ProviderConnection() = default;
    ProviderConnection(const ProviderConnection&) = delete;
    ProviderConnection& operator=(const ProviderConnection&) = delete;

    /**
     * Connects the provider to a broker, which then serves all requests. Opens the request lock if it was
     * closed. Returns at once if the broker and its tables are those of the last call: managers call factories often,
     * possibly while they hold a lock, and must not wait for requests.
     * @throws ManagerGone if the object manager or the process is shutting down
     */
    void connect(const CMPIBroker* manager);

    /** Unloads the provider when the process ends. */
    void endProcess();

    /** The object manager's broker; null if there is none. Waits for no request. */
    const CMPIBroker* broker() const;

    /** Waits for the requests, ends the provider and forgets the broker. */
    void shutdown(const CMPIContext* context);

    /** @name Callable with the request lock held, while there is a broker */
    ///@{
    WrappedBroker& wrappedBroker() { return *wrapped; }
    CMPIInstanceMI* instanceInterface() const { return instances; }
    CMPIAssociationMI* associationInterface() const { return associations; }

    /**
     * Ensures that this process owns the data directory, for a change. Releases the lock until another owner ends.
     * Fails with CMPI_RC_ERR_FAILED if that takes too long.
     */
    void requireOwner(LockGuard& guard);

    /** Marks the provider's tables as different from its files, so that requireCurrent() loads it again. */
    void setOutdated() { isOutdated = true; }

    /**
     * Loads the provider if it is not loaded or outdated. Releases the lock until no other request is in an up-call of
     * the provider, since it cannot be unloaded before, and until no other process writes the files. Fails with
     * CMPI_RC_ERR_FAILED if that takes too long, or if a file was removed, whose records would be lost.
     * @param mayBeOlder whether the provider may have older records: then it waits for newer ones only briefly
     */
    void requireCurrent(LockGuard& guard, bool mayBeOlder);

    /** @name Whether a class's table has been compared with its file since the provider was loaded */
    bool isVerified(const Class& owner) const { return (verified & bitOf(owner)) != 0; }
    void setVerified(const Class& owner) { verified |= bitOf(owner); }

    /**
     * Whether the provider has read the record file of a class, or the class has none. The provider does not report
     * that it could not read. So its records are counted once: fails with CMPI_RC_ERR_FAILED unless they are as many as
     * the file had when the provider was loaded.
     * @param count the number of the provider's records; none if they are not counted yet
     * @return false if they have to be counted
     */
    bool hasRead(const Class& owner, std::optional<std::size_t> count);
    ///@}

private:
    static std::size_t bitOf(const Class& owner) { return std::size_t{1} << (&owner - Classes().begin()); }

    bool load();
    void unload();
    void createInterfaces();
    bool isConnectedTo(const CMPIBroker* manager) const;
    void set(const CMPIBroker* manager);
    void endProvider(const CMPIContext* context);

    ProviderLibrary library{};
    bool isOutdated = false;
    std::size_t verified = 0;                                                   ///< a bit of each class
    std::size_t read = 0;                                                       ///< the same
    std::array<std::optional<std::size_t>, durable::recordFileCount> counts{};  ///< when the provider was loaded
    std::size_t upCalls = 0;  ///< requests in the provider that have released the lock
    std::optional<WrappedBroker> wrapped{};
    CMPIInstanceMI* instances = nullptr;
    CMPIAssociationMI* associations = nullptr;
    mutable std::mutex mutex{};  ///< of the members below, for callers without the request lock
    const CMPIBroker* managersOwn = nullptr;
    CMPIBroker tables{};  ///< a copy of the broker, made when the provider was connected
};

extern ProviderConnection theConnection;

}  // namespace gate
