#include "server/ConnectionTable.h"

#include <sys/socket.h>

#include <algorithm>
#include <utility>

#include "server/Sockets.h"

namespace cimhost::server {
namespace {

/** A connection is stalled if its body is incomplete, or no byte of its response is acknowledged, for this time. */
constexpr std::chrono::seconds stalledTime{1};

/** Most bytes that the system counts when a client closes its connection: one for the end, more for a TLS alert. */
constexpr std::uint64_t closureSize = 1;
constexpr std::uint64_t tlsClosureSize = 64;

using Guard = std::lock_guard<std::mutex>;

}  // namespace

std::string ClientAddress::host() const {
    const std::string host = address.substr(0, address.rfind(':'));
    return !host.empty() && host.front() == '[' ? host.substr(1, host.size() - 2) : host;
}

Connection::Connection(int itsSocket, bool isTls, ClientAddress itsClient)
    : descriptor(itsSocket),
      tls(isTls),
      origin(std::move(itsClient)),
      current(isTls ? Phase::handshake : Phase::idle),
      since(Clock::now()),
      progress(since) {}

bool Connection::enter(Phase next) {
    const Guard lock(mutex);
    current = next;
    since = Clock::now();
    progress = since;
    headSince = {};
    if (next == Phase::idle) {
        received = bytesReceived(descriptor);
    }
    return cause == Cause::none;
}

Connection::Phase Connection::phase() const {
    const Guard lock(mutex);
    return current;
}

void Connection::endHandshake(gnutls_session_t itsSession) {
    enter(Phase::idle);
    const Guard lock(mutex);
    session = itsSession;
    received -= std::min(received, bytesUnread(descriptor));  // the client may already have sent its request
}

void Connection::trust() {
    const Guard lock(mutex);
    isTrusted = true;
}

void Connection::waitUntil(Clock::time_point time, const std::function<bool()>& isDone) {
    std::unique_lock<std::mutex> lock(mutex);
    changed.wait_until(lock, time, [&] { return cause != Cause::none || isDone(); });
}

void Connection::wake() {
    const Guard lock(mutex);
    changed.notify_all();
}

bool Connection::hasTimedOut() const {
    const Guard lock(mutex);
    return cause == Cause::time;
}

bool Connection::hasPartOfHead() const {
    const Guard lock(mutex);
    return current == Phase::idle && bytesReceived(descriptor) - received > (tls ? tlsClosureSize : closureSize);
}

bool Connection::isEnding() const {
    const Guard lock(mutex);
    return cause != Cause::none;
}

void Connection::end(Cause why) {
    const Guard lock(mutex);
    if (cause != Cause::none) {
        return;
    }
    cause = why;
    // In the idle phase, the thread of a TLS connection may be sending a refusal.
    const bool lacksRequest =
        current == Phase::idle && !tls && (why == Cause::time ? headSince != Clock::time_point{} : !isTrusted);
    if (current == Phase::body || lacksRequest) {
        sendStatus(why == Cause::time ? "408 Request Timeout" : "503 Service Unavailable");
    }
    ::shutdown(descriptor, SHUT_RDWR);
    changed.notify_all();
}

/** Called while the connection's thread only receives: a TLS session permits another thread to send meanwhile. */
void Connection::sendStatus(const std::string& status) const {
    const std::string response = "HTTP/1.1 " + status + "\r\nConnection: close\r\nContent-Length: 0\r\n\r\n";
    if (session != nullptr) {
        static_cast<void>(::gnutls_record_send(session, response.data(), response.size()) < 0);
        static_cast<void>(::gnutls_bye(session, GNUTLS_SHUT_WR));
    } else if (!tls) {
        static_cast<void>(::send(descriptor, response.data(), response.size(), MSG_NOSIGNAL | MSG_DONTWAIT) < 0);
    }
}

bool Connection::isOverdue(const Limits& limits, Clock::time_point now) {
    const Guard lock(mutex);
    const auto age = now - since;
    switch (current) {
        case Phase::handshake:
            return age > limits.headTime;
        case Phase::check:
        case Phase::work:
            return false;
        case Phase::body:
            return age > limits.bodyTime;
        case Phase::response:
            return age > limits.responseTime;
        case Phase::refusal:  // begins with the delay
            return age > limits.failureDelay + limits.responseTime;
        default:
            break;
    }
    if (bytesReceived(descriptor) == received) {
        headSince = {};
        return age > limits.idleTime;
    }
    if (headSince == Clock::time_point{}) {
        headSince = now;
    }
    return now - headSince > limits.headTime;
}

void Connection::observe(Clock::time_point now) {
    const Guard lock(mutex);
    const std::uint64_t count = current == Phase::response ? bytesAcknowledged(descriptor) : acknowledged;
    if (count != acknowledged) {
        acknowledged = count;
        progress = now;
    }
}

std::optional<std::pair<int, Connection::Clock::time_point>> Connection::rank(Clock::time_point now) const {
    const Guard lock(mutex);
    if (cause != Cause::none) {
        return std::nullopt;
    }
    const bool isStalled = now - progress > stalledTime;
    switch (current) {
        case Phase::refusal:
            return std::pair{0, since};
        case Phase::handshake:
            return std::pair{1, since};
        case Phase::idle:
            return std::pair{isTrusted ? 3 : 1, since};
        case Phase::check:
            return isTrusted ? std::nullopt : std::optional(std::pair{1, since});
        case Phase::body:
            return std::pair{!isTrusted ? 1 : isStalled ? 2 : 5, since};
        case Phase::response:
            return isStalled ? std::optional(std::pair{4, since}) : std::nullopt;
        default:
            return std::nullopt;
    }
}

Connection* ConnectionTable::add(int socket, bool isTls, ClientAddress client) {
    const Guard lock(mutex);
    const auto isNeighbour = [&](const Connection& each) { return each.origin.network == client.network; };
    const bool hasRoom = count(isNeighbour) < limits.connectionsPerAddress || endOne(isNeighbour);
    const auto isAny = [](const Connection&) { return true; };
    if (hasRoom && count(isAny) >= limits.connections) {
        endOne(isAny);
    }
    Connection& added = connections.emplace_back(socket, isTls, std::move(client));
    if (!hasRoom || isClosed) {
        added.end(Connection::Cause::room);
    }
    return &added;
}

void ConnectionTable::remove(const Connection* connection) {
    const Guard lock(mutex);
    connections.remove_if([&](const Connection& each) { return &each == connection; });
}

std::size_t ConnectionTable::size() const {
    const Guard lock(mutex);
    return connections.size();
}

std::size_t ConnectionTable::busy() const {
    using Phase = Connection::Phase;
    constexpr auto isBusy = [](Phase phase) {
        return phase == Phase::check || phase == Phase::body || phase == Phase::work || phase == Phase::response;
    };
    const Guard lock(mutex);
    return static_cast<std::size_t>(std::count_if(connections.begin(), connections.end(),
                                                  [&](const Connection& each) { return isBusy(each.phase()); }));
}

/** Number of matching connections that are not being ended. */
std::size_t ConnectionTable::count(const Filter& isCounted) const {
    return static_cast<std::size_t>(std::count_if(connections.begin(), connections.end(), [&](const Connection& each) {
        return isCounted(each) && !each.isEnding();
    }));
}

bool ConnectionTable::endOne(const Filter& mayEnd) {
    const auto now = Connection::Clock::now();
    Connection* first = nullptr;
    decltype(first->rank(now)) lowest;
    for (Connection& each : connections) {
        const auto rank = mayEnd(each) ? each.rank(now) : std::nullopt;
        if (rank && (!lowest || *rank < *lowest)) {
            lowest = rank;
            first = &each;
        }
    }
    if (first != nullptr) {
        first->end(Connection::Cause::room);
    }
    return first != nullptr;
}

void ConnectionTable::endHandshake(int socket, gnutls_session_t session) {
    const Guard lock(mutex);
    for (Connection& each : connections) {
        if (each.socket() == socket && each.phase() == Connection::Phase::handshake) {
            each.endHandshake(session);
        }
    }
}

void ConnectionTable::endOverdue(Connection::Clock::time_point now) {
    const Guard lock(mutex);
    for (Connection& each : connections) {
        each.observe(now);
        if (each.isOverdue(limits, now)) {
            each.end(Connection::Cause::time);
        }
    }
}

void ConnectionTable::endStalledResponse() {
    const Guard lock(mutex);
    endOne([](const Connection& each) { return each.phase() == Connection::Phase::response; });
}

void ConnectionTable::endAll() {
    const Guard lock(mutex);
    isClosed = true;
    for (Connection& each : connections) {
        each.end(Connection::Cause::room);
    }
}

}  // namespace cimhost::server
