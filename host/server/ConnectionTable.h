#pragma once

#include <atomic>
#include <chrono>
#include <cstdint>
#include <list>
#include <mutex>
#include <string>

#include "server/Settings.h"

namespace cimhost::server {

/** A client's connection, and the phase of its current request. Phases are set by the thread of the connection. */
class Connection {
public:
    enum class Phase {
        idle,     ///< no request, or the head of one arrives
        body,     ///< the body arrives
        work,     ///< the operation runs
        response  ///< the client receives the response
    };

    explicit Connection(int itsSocket, bool isTls);

    void enter(Phase next);
    Phase phase() const { return current; }
    int socket() const { return descriptor; }
    bool isTls() const { return tls; }

    /** @name The last accepted credentials, for later requests of this connection. Used by its thread only. */
    ///@{
    std::string authorization{};
    std::chrono::steady_clock::time_point authorizedUntil{};
    ///@}

private:
    friend class ConnectionTable;
    using Clock = std::chrono::steady_clock;

    int descriptor;
    bool tls;
    std::atomic<Phase> current{Phase::idle};
    std::atomic<Clock::rep> since;           ///< when the phase began
    std::atomic<std::uint64_t> received{0};  ///< bytes received when it began
    Clock::time_point headSince{};           ///< when the head began to arrive; of the watching thread only
    bool isEnding = false;                   ///< whether it has been ended for a new one; guarded by the table
};

/** All connections. Ends those that exceed a time limit; a client that sends its request too slowly receives 408. */
class ConnectionTable {
public:
    explicit ConnectionTable(const Limits& itsLimits) : limits(itsLimits) {}

    /**
     * Adds a connection. If there are too many, the one that is longest without a request ends instead.
     * @return the connection, which belongs to the table until it is removed
     */
    Connection* add(int socket, bool isTls);
    void remove(const Connection* connection);
    std::size_t size() const;

    /** Number of connections with a request. */
    std::size_t busy() const;

    /** Ends connections that have exceeded their time. To be called several times per second. */
    void endOverdue(Connection::Clock::time_point now);

    /** Ends connections without a request, or all. */
    void endAll(bool alsoBusy);

private:
    void endLongestIdle();
    bool isOverdue(Connection& connection, Connection::Clock::time_point now) const;

    const Limits& limits;
    mutable std::mutex mutex;
    std::list<Connection> connections;
};

}  // namespace cimhost::server
