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

/** A client's connection, and the phase of its current request. The connection's thread enters the phases. */
class Connection {
public:
    using Clock = std::chrono::steady_clock;
    enum class Phase {
        handshake,  ///< of TLS
        idle,       ///< no request, or a head arrives
        check,      ///< the head and its password are checked
        body,       ///< the body arrives
        work,       ///< the operation runs
        response,   ///< the client receives the response
        refusal     ///< the client waits for a refusal, or receives it
    };

    Connection(int itsSocket, bool isTls, ClientAddress itsClient = {});

    /** @return false if the table has ended the connection */
    bool enter(Phase next);
    Phase phase() const;

    /** Marks a TLS connection as ready for requests. Call when the client's last handshake message has been read. */
    void endHandshake(gnutls_session_t itsSession);

    /** Records that a password or request was accepted. A trusted connection is ended later for a new one. */
    void trust();

    /**
     * Waits until a time is reached, a condition is true or the connection is ended.
     * @param isDone condition on atomic variables; call wake() after changing them
     */
    void waitUntil(
        Clock::time_point time, const std::function<bool()>& isDone = [] { return false; });
    void wake();

    /** Whether the table has ended the connection. */
    bool isEnding() const;

    /** Whether the table has ended the connection because the client was too slow. */
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

    /** Records whether the client has received more bytes of its response. */
    void observe(Clock::time_point now);

    /** Rank and age. The connection with the lowest is ended first for a new one. None: must not be ended for one. */
    std::optional<std::pair<int, Clock::time_point>> rank(Clock::time_point now) const;

    const int descriptor;
    const bool tls;
    gnutls_session_t session = nullptr;  ///< of a TLS connection after its handshake
    const ClientAddress origin;
    mutable std::mutex mutex;
    std::condition_variable changed;  ///< the cause, or the condition of waitUntil()
    Cause cause = Cause::none;
    Phase current;
    bool isTrusted = false;
    Clock::time_point since;         ///< when the phase began
    std::uint64_t received = 0;      ///< bytes received when the idle phase began
    Clock::time_point headSince{};   ///< when the first byte of the head was seen; zero before that
    std::uint64_t acknowledged = 0;  ///< bytes that the client had acknowledged at `progress`
    Clock::time_point progress;      ///< when the phase began, or bytes of the response were last acknowledged
};

/**
 * All connections. Ends those that exceed a time limit; the client receives 408 if its body, or without TLS its head,
 * arrives too slowly. If there are too many connections, of one network or altogether, each new one ends another: first
 * those that were refused, then those without an accepted password or request, then those whose body is stalled, then
 * idle ones, then those whose response is stalled, finally those whose body arrives; in each group the oldest. A client
 * whose body is incomplete then receives 503, and so does one without TLS that has not sent its first request.
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

    /** Ends connections that have exceeded a time limit. Call several times per second. */
    void endOverdue(Connection::Clock::time_point now);

    /** Ends the oldest connection whose response is stalled, if there is one. */
    void endStalledResponse();

    /** Ends all connections, and those that are added later. A running operation completes without a response. */
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
