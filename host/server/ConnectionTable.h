#pragma once

#include <gnutls/gnutls.h>

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <list>
#include <mutex>
#include <optional>
#include <string>
#include <utility>

#include "server/Settings.h"

namespace cimhost::server {

/** The origin of a connection. */
struct ClientAddress {
    std::string address{};  ///< with the port, for the access log
    std::string network{};  ///< the part of the address that the limit of connections applies to

    /** The address without its port, and without the brackets of an IPv6 address. */
    std::string host() const;
};

/** A client's connection, and the phase of its current request. Phases are entered by the thread of the connection. */
class Connection {
public:
    using Clock = std::chrono::steady_clock;
    enum class Phase {
        handshake,  ///< of TLS
        idle,       ///< no request, or the head of one arrives
        check,      ///< the head is checked, with its password
        body,       ///< the body arrives
        work,       ///< the operation runs
        response,   ///< the client receives the response
        refusal     ///< the client waits for a refusal, or receives it
    };

    Connection(int itsSocket, bool isTls, ClientAddress itsClient = {});

    /** @return false if the table has ended the connection */
    bool enter(Phase next);
    Phase phase() const;

    /** Marks a TLS connection as ready for requests. To be called when the client's last message has been read. */
    void endHandshake(gnutls_session_t itsSession);

    /** Notes that the client has sent a request that was accepted: its connection is ended for new ones later. */
    void trust();

    /**
     * Waits until a time, but not longer than until a condition is true or the connection is ended.
     * @param isDone its value must be atomic; call wake() after a change
     */
    void waitUntil(
        Clock::time_point time, const std::function<bool()>& isDone = [] { return false; });
    void wake();

    /** Whether the table has ended it. */
    bool isEnding() const;

    /** Whether it was ended because the client was too slow. */
    bool hasTimedOut() const;

    /** Whether a part of a head has arrived. */
    bool hasPartOfHead() const;

    int socket() const { return descriptor; }
    const ClientAddress& client() const { return origin; }

    /** @name State for later requests of this connection. Used by its thread only. */
    ///@{
    std::string authorization{};  ///< the last accepted credentials
    Clock::time_point authorizedUntil{};
    bool usesChunks = false;  ///< whether a response was sent in chunks
    ///@}

private:
    friend class ConnectionTable;
    enum class Cause { none, time, room };

    /** Shuts the connection down, so that its thread ends it. */
    void end(Cause why);
    void sendStatus(const std::string& status) const;
    bool isOverdue(const Limits& limits, Clock::time_point now);

    /** Notes whether the client receives its response. */
    void observe(Clock::time_point now);

    /** Rank and age: the lower, the earlier it is ended for a new connection; none if it is not ended for one. */
    std::optional<std::pair<int, Clock::time_point>> rank(Clock::time_point now) const;

    const int descriptor;
    const bool tls;
    gnutls_session_t session = nullptr;  ///< of a TLS connection after its handshake
    const ClientAddress origin;
    mutable std::mutex mutex;
    std::condition_variable changed;  ///< the cause, or what waitUntil() waits for
    Cause cause = Cause::none;
    Phase current;
    bool isTrusted = false;
    Clock::time_point since;         ///< when the phase began
    std::uint64_t received = 0;      ///< bytes received when it began
    Clock::time_point headSince{};   ///< when the first byte of the head was seen; none before that
    std::uint64_t acknowledged = 0;  ///< bytes that the client had acknowledged at `progress`
    Clock::time_point progress;      ///< when the phase began, or bytes of the response were last acknowledged
};

/**
 * All connections. Ends those that exceed a time limit; a client that sends its request too slowly receives 408. If
 * there are too many connections, of one network or altogether, each new one ends another: first those that were
 * refused, then those without an accepted password or request, then those whose body does not arrive, then idle ones,
 * then those that do not receive their response, at last those whose body arrives; of several the oldest. A client
 * whose request has not arrived then receives 503, unless an earlier one was served.
 */
class ConnectionTable {
public:
    explicit ConnectionTable(const Limits& itsLimits) : limits(itsLimits) {}

    /**
     * Adds a connection. If its network has too many and none of them can be ended, the new one is ended.
     * @return the connection, which belongs to the table until it is removed
     */
    Connection* add(int socket, bool isTls, ClientAddress client = {});
    void remove(const Connection* connection);
    std::size_t size() const;

    /** Number of connections with a request that has not been refused. */
    std::size_t busy() const;

    /** Marks the TLS connection of a session's socket as ready for requests. */
    void endHandshake(int socket, gnutls_session_t session);

    /** Ends connections that have exceeded their time. To be called several times per second. */
    void endOverdue(Connection::Clock::time_point now);

    /** Ends the oldest connection with a client that does not receive its response, if there is one. */
    void endStalledResponse();

    /** Ends all connections, also those that are added later; those with a running request end after it. */
    void endAll();

private:
    using Filter = std::function<bool(const Connection&)>;
    std::size_t count(const Filter& isCounted) const;
    bool endOne(const Filter& mayEnd);

    const Limits& limits;
    mutable std::mutex mutex;
    bool isClosed = false;
    std::list<Connection> connections;
};

}  // namespace cimhost::server
