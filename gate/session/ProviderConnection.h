#pragma once

#include <array>
#include <cstddef>
#include <mutex>
#include <optional>
#include <tuple>

#include "RequestLock.h"
#include "durable/RecordFile.h"
#include "gate/cmpi/Schema.h"
#include "gate/cmpi/WrappedBroker.h"

namespace gate {

/**
 * The provider's shared library, in the directory of this one. It is not linked, because the provider reads its record
 * files each time it is loaded, and the files must be recovered before that.
 */
class ProviderLibrary {
public:
    bool isLoaded() const { return handle != nullptr; }

    /**
     * Loads the library. Throws std::runtime_error with the reason if that fails, or if another part of the process has
     * loaded the library, since the provider would not read its files again.
     */
    void load();

    /** Unloads the library if it is loaded. After that, there are no interfaces. */
    void unload();

    /** Calls the factories of the loaded library. Fails with CMPI_RC_ERR_FAILED unless both return an interface. */
    void createInterfaces(const CMPIBroker* broker);

    /** The provider's interface that has a function of this type; null if there is none. */
    template <class Table, class Interface, class... Arguments>
    Interface* interfaceWith(CMPIStatus (*Table::*)(Interface*, Arguments...)) const {
        return std::get<Interface*>(interfaces);
    }

private:
    void* handle = nullptr;
    std::tuple<CMPIInstanceMI*, CMPIAssociationMI*> interfaces{};
};

/** The process's only connection between the provider and an object manager. Loads and unloads the provider. */
class ProviderConnection {
public:
    /** The provider's table of a record file. */
    struct Table {
        const char* name;                    ///< of the class
        std::optional<std::size_t> count{};  ///< of the file's records when the provider was loaded
        bool isRead = false;                 ///< whether it is known that the provider has read the file
        bool isVerified = false;  ///< whether it has been compared with the file since the provider was loaded
    };

    constexpr ProviderConnection() = default;

    /**
     * Connects the provider to a broker, which then serves all requests. Opens the request lock if it was closed.
     * Returns at once if the broker and its tables are the same as in the last call: managers call factories often,
     * some with a lock held, and must not wait for requests.
     * @throws ManagerGone if the object manager or the process is shutting down
     */
    void connect(const CMPIBroker* manager);

    /** Unloads the provider and releases the data directory, unless a request is in an up-call. Called at shutdown. */
    void endProcess();

    /** The object manager's broker; null if there is none. Does not wait for requests. */
    const CMPIBroker* broker() const;

    /** Waits for the running requests, then cleans up and unloads the provider, and forgets the broker. */
    void shutdown(const CMPIContext* context);

    /** @name Functions to call with the request lock held, while there is a broker */
    ///@{
    WrappedBroker& wrappedBroker() { return *wrapped; }
    const ProviderLibrary& provider() const { return library; }

    /**
     * Ensures that this process owns the data directory, for a change. Waits with the lock released until another owner
     * ends. Fails with CMPI_RC_ERR_FAILED if that takes too long, or if this process cannot be the owner.
     */
    void requireOwner(LockGuard& guard);

    /** Marks the provider's tables as different from its files, so that requireCurrent() loads the provider again. */
    void setOutdated() { isOutdated = true; }

    /**
     * Loads the provider if it is outdated or not loaded. Before that, waits with the lock released until no request is
     * in an up-call, since the provider could not be unloaded, and until no other process writes the files. Fails with
     * CMPI_RC_ERR_FAILED if that takes too long, or if a file was removed, because its records would be lost.
     * @param mayBeOlder whether older records suffice: then the wait for newer ones is short
     */
    void requireCurrent(LockGuard& guard, bool mayBeOlder);

    /** The provider's table of a class; null if the class has no record file. */
    Table* tableOf(const Class& requested) { return cim::findNamed(tables, requested.name); }

    /**
     * Fails with CMPI_RC_ERR_FAILED unless the provider has as many records of a class as the file had when the
     * provider was loaded: the provider does not report failed reads. Once they match, later calls do not compare them.
     */
    void requireRead(const Class& requested, std::size_t count);
    ///@}

private:
    bool load();
    bool isConnectedTo(const CMPIBroker* manager) const;
    void set(const CMPIBroker* manager);

    ProviderLibrary library{};
    bool isOutdated = false;
    std::array<Table, durable::recordFileCount> tables{Table{"VELKO_Lease"}, Table{"VELKO_Warranty"}};  ///< per file
    std::size_t upCalls = 0;  ///< requests in the provider that have released the lock
    std::optional<WrappedBroker> wrapped{};
    mutable std::mutex mutex{};  ///< protects the members below, for callers without the request lock
    const CMPIBroker* managersOwn = nullptr;
    CMPIBroker connectedBroker{};  ///< a copy of the broker, made when the provider was connected
};

extern ProviderConnection theConnection;

}  // namespace gate
