#pragma once

#include "RequestLock.h"
#include "gate/cmpi/WrappedBroker.h"

#include <mutex>
#include <optional>

namespace gate {

/** The process's only connection between the provider and an object manager. */
class ProviderConnection {
public:
    constexpr ProviderConnection() = default;
    ProviderConnection(const ProviderConnection&) = delete;
    ProviderConnection& operator=(const ProviderConnection&) = delete;

    /**
     * Connects the provider to a broker, which from then on serves all requests. Opens the request lock if it was
     * closed. Returns at once if the broker and its tables are those of the last call: managers call factories often,
     * possibly while they hold a lock, and must not wait for requests.
     * @throws ManagerGone if the object manager or the process is shutting down
     */
    void connect(const CMPIBroker* manager);

    /** The object manager's broker; null if there is none. Waits for no request. */
    const CMPIBroker* broker() const;

    /** Waits for the requests, ends the provider and forgets the broker. */
    void shutdown(const CMPIContext* context);

    /** @name Callable with the request lock held, while there is a broker */
    ///@{
    WrappedBroker& wrappedBroker() { return *wrapped; }
    CMPIInstanceMI* instanceInterface() const { return instances; }
    CMPIAssociationMI* associationInterface() const { return associations; }
    ///@}

private:
    bool isConnectedTo(const CMPIBroker* manager) const;
    void set(const CMPIBroker* manager);
    void endProvider(const CMPIContext* context);

    std::optional<WrappedBroker> wrapped{};
    CMPIInstanceMI* instances = nullptr;
    CMPIAssociationMI* associations = nullptr;
    mutable std::mutex mutex{};  ///< of the members below, for callers without the request lock
    const CMPIBroker* managersOwn = nullptr;
    CMPIBroker tables{};  ///< a copy of the broker, made when the provider was connected
};

extern ProviderConnection theConnection;

}  // namespace gate
