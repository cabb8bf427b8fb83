#include "server/Sockets.h"

#include <linux/tcp.h>
#include <netdb.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <chrono>
#include <cstring>
#include <memory>

namespace cimhost::server {
namespace {

constexpr std::chrono::seconds discardTime{2};

tcp_info informationOf(int socket) {
    tcp_info information{};
    socklen_t size = sizeof information;
    return ::getsockopt(socket, IPPROTO_TCP, TCP_INFO, &information, &size) == 0 ? information : tcp_info{};
}

}  // namespace

std::string addressText(const sockaddr* address) {
    std::array<char, NI_MAXHOST> host{};
    std::array<char, NI_MAXSERV> port{};
    const socklen_t size = address->sa_family == AF_INET6 ? sizeof(sockaddr_in6) : sizeof(sockaddr_in);
    if (::getnameinfo(address, size, host.data(), host.size(), port.data(), port.size(),
                      NI_NUMERICHOST | NI_NUMERICSERV) != 0) {
        return "unknown";
    }
    const bool isSix = address->sa_family == AF_INET6;
    return (isSix ? "[" : "") + std::string(host.data()) + (isSix ? "]:" : ":") + port.data();
}

void requireOpenFiles(std::size_t connections, std::size_t listeners) {
    constexpr std::size_t others = 256;  // other files of the server and the providers
    const std::size_t needed = connections + listeners * endingConnections + others;
    rlimit files{};
    ::getrlimit(RLIMIT_NOFILE, &files);
    files.rlim_cur = files.rlim_max;
    ::setrlimit(RLIMIT_NOFILE, &files);
    if (files.rlim_max < needed) {
        throw SettingsError("limits.connections = " + std::to_string(connections) + " needs " + std::to_string(needed) +
                            " open files, but this process may open " + std::to_string(files.rlim_max) +
                            "; lower it, or raise the limit (ulimit -Hn, LimitNOFILE of the service)");
    }
}

int openSocket(const Listener& listener) {
    addrinfo hints{};
    hints.ai_flags = AI_PASSIVE | AI_NUMERICHOST | AI_NUMERICSERV;
    hints.ai_socktype = SOCK_STREAM;
    addrinfo* found = nullptr;
    const int result = ::getaddrinfo(listener.address.c_str(), std::to_string(listener.port).c_str(), &hints, &found);
    if (result != 0) {
        throw SettingsError(listener.url() + ": " + ::gai_strerror(result));
    }
    const std::unique_ptr<addrinfo, decltype(&::freeaddrinfo)> address(found, &::freeaddrinfo);
    const int socket = ::socket(found->ai_family, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0);
    const int on = 1;
    ::setsockopt(socket, SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
    if (found->ai_family == AF_INET6) {
        ::setsockopt(socket, IPPROTO_IPV6, IPV6_V6ONLY, &on, sizeof on);
    }
    if (socket < 0 || ::bind(socket, found->ai_addr, found->ai_addrlen) != 0 || ::listen(socket, SOMAXCONN) != 0) {
        const std::string reason = std::strerror(errno);
        ::close(socket);
        throw SettingsError(listener.url() + ": " + reason);
    }
    return socket;
}

std::uint16_t portOf(int socket) {
    sockaddr_storage address{};
    socklen_t size = sizeof address;
    if (::getsockname(socket, reinterpret_cast<sockaddr*>(&address), &size) != 0) {
        return 0;
    }
    return ntohs(address.ss_family == AF_INET6 ? reinterpret_cast<const sockaddr_in6&>(address).sin6_port
                                               : reinterpret_cast<const sockaddr_in&>(address).sin_port);
}

std::string networkOf(const sockaddr* address) {
    if (address->sa_family == AF_INET6) {
        const auto& six = reinterpret_cast<const sockaddr_in6*>(address)->sin6_addr;
        const auto* const bytes = reinterpret_cast<const char*>(&six);
        return IN6_IS_ADDR_V4MAPPED(&six) ? std::string(bytes + sizeof six - sizeof(in_addr), sizeof(in_addr))
                                          : std::string(bytes, sizeof six / 2);
    }
    const auto& four = reinterpret_cast<const sockaddr_in*>(address)->sin_addr;
    return {reinterpret_cast<const char*>(&four), sizeof four};
}

std::uint64_t bytesReceived(int socket) {
    return informationOf(socket).tcpi_bytes_received;
}

std::uint64_t bytesUnread(int socket) {
    int count = 0;
    return ::ioctl(socket, FIONREAD, &count) == 0 ? static_cast<std::uint64_t>(count) : 0;
}

std::uint64_t bytesAcknowledged(int socket) {
    return informationOf(socket).tcpi_bytes_acked;
}

void discardInput(int socket, std::size_t most) {
    using Clock = std::chrono::steady_clock;
    const Clock::time_point end = Clock::now() + discardTime;
    std::array<char, 16384> buffer{};
    for (std::size_t received = 0; received <= most;) {
        const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(end - Clock::now()).count();
        pollfd readable{socket, POLLIN, 0};
        if (left <= 0 || ::poll(&readable, 1, static_cast<int>(left)) <= 0) {
            return;
        }
        const ssize_t count = ::recv(socket, buffer.data(), buffer.size(), MSG_DONTWAIT);
        if (count <= 0) {
            return;
        }
        received += static_cast<std::size_t>(count);
    }
}

void awaitInputBriefly(int socket) {
    constexpr int most = 100;
    pollfd readable{socket, POLLIN, 0};
    int count = 0;
    for (int attempts = 0; attempts < most && count == 0; ++attempts) {
        count = ::poll(&readable, 1, 0);
    }
}

}  // namespace cimhost::server
