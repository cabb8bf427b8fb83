#include "server/ConnectionTable.h"

#include <linux/tcp.h>
#include <netinet/in.h>
#include <sys/socket.h>

#include <algorithm>
#include <string_view>

namespace cimhost::server {
namespace {

/** Number of bytes that a socket has received. */
std::uint64_t bytesReceived(int socket) {
    tcp_info info{};
    socklen_t size = sizeof info;
    return ::getsockopt(socket, IPPROTO_TCP, TCP_INFO, &info, &size) == 0 ? info.tcpi_bytes_received : 0;
}

void end(const Connection& connection) {
    const bool awaitsRequest = connection.phase() == Connection::Phase::body;
    if (awaitsRequest && !connection.isTls()) {
        constexpr std::string_view timeout =
            "HTTP/1.1 408 Request Timeout\r\nConnection: close\r\nContent-Length: 0\r\n\r\n";
        static_cast<void>(::send(connection.socket(), timeout.data(), timeout.size(), MSG_NOSIGNAL | MSG_DONTWAIT) < 0);
    }
    ::shutdown(connection.socket(), SHUT_RDWR);
}

}  // namespace

Connection::Connection(int itsSocket, bool isTls)
    : descriptor(itsSocket), tls(isTls), since(Clock::now().time_since_epoch().count()) {}

void Connection::enter(Phase next) {
    current = next;
    since = Clock::now().time_since_epoch().count();
    if (next == Phase::idle) {
        received = bytesReceived(descriptor);
    }
}

Connection* ConnectionTable::add(int socket, bool isTls) {
    const std::lock_guard<std::mutex> lock(mutex);
    if (connections.size() >= limits.connections) {
        endLongestIdle();
    }
    return &connections.emplace_back(socket, isTls);
}

void ConnectionTable::remove(const Connection* connection) {
    const std::lock_guard<std::mutex> lock(mutex);
    connections.remove_if([&](const Connection& each) { return &each == connection; });
}

std::size_t ConnectionTable::size() const {
    const std::lock_guard<std::mutex> lock(mutex);
    return connections.size();
}

std::size_t ConnectionTable::busy() const {
    const std::lock_guard<std::mutex> lock(mutex);
    return static_cast<std::size_t>(std::count_if(connections.begin(), connections.end(), [](const Connection& each) {
        return each.phase() != Connection::Phase::idle;
    }));
}

void ConnectionTable::endLongestIdle() {
    Connection* longest = nullptr;
    for (Connection& each : connections) {
        const bool isIdle = each.phase() == Connection::Phase::idle && !each.isEnding;
        if (isIdle && (longest == nullptr || each.since < longest->since)) {
            longest = &each;
        }
    }
    if (longest != nullptr) {
        longest->isEnding = true;
        end(*longest);
    }
}

bool ConnectionTable::isOverdue(Connection& connection, Connection::Clock::time_point now) const {
    const auto age = now.time_since_epoch() - Connection::Clock::duration(connection.since);
    switch (connection.phase()) {
        case Connection::Phase::body:
            return age > limits.bodyTime;
        case Connection::Phase::work:
            return false;
        case Connection::Phase::response:
            return age > limits.responseTime;
        default:
            break;
    }
    if (bytesReceived(connection.socket()) == connection.received) {
        connection.headSince = {};
        return age > limits.idleTime;
    }
    if (connection.headSince == Connection::Clock::time_point{}) {
        connection.headSince = now;
    }
    // Two samples may be of different requests: then the phase is younger.
    return age > limits.headTime && now - connection.headSince > limits.headTime;
}

void ConnectionTable::endOverdue(Connection::Clock::time_point now) {
    const std::lock_guard<std::mutex> lock(mutex);
    for (Connection& each : connections) {
        if (isOverdue(each, now)) {
            end(each);
        }
    }
}

void ConnectionTable::endAll(bool alsoBusy) {
    const std::lock_guard<std::mutex> lock(mutex);
    for (const Connection& each : connections) {
        if (alsoBusy || each.phase() == Connection::Phase::idle) {
            ::shutdown(each.socket(), SHUT_RDWR);
        }
    }
}

}  // namespace cimhost::server
