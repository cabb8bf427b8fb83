#pragma once

#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <cstdint>
#include <string>
#include <utility>

namespace cimhost::server::test {

/** A socket that the destructor closes. */
class Socket {
public:
    explicit Socket(int itsDescriptor) : descriptor(itsDescriptor) {}
    ~Socket() { close(); }
    Socket(Socket&& other) noexcept : descriptor(std::exchange(other.descriptor, -1)) {}
    Socket(const Socket&) = delete;
    Socket& operator=(const Socket&) = delete;

    int get() const { return descriptor; }

    void close() {
        if (descriptor >= 0) {
            ::close(std::exchange(descriptor, -1));
        }
    }

    void send(const std::string& bytes) const {
        // A failure is ignored: if the server has ended the connection, a later receive() returns nothing more.
        static_cast<void>(::send(descriptor, bytes.data(), bytes.size(), MSG_NOSIGNAL) < 0);
    }

    /** All bytes until the other side closes the connection. */
    std::string receive() const {
        std::string received;
        std::array<char, 4096> buffer{};
        for (ssize_t count = 0; (count = ::recv(descriptor, buffer.data(), buffer.size(), 0)) > 0;) {
            received.append(buffer.data(), static_cast<std::size_t>(count));
        }
        return received;
    }

    /** Bytes until they contain a string, or the other side closes the connection. */
    std::string receiveUntil(const std::string& last) const {
        std::string received;
        for (char byte = 0; received.find(last) == std::string::npos && ::recv(descriptor, &byte, 1, 0) == 1;) {
            received += byte;
        }
        return received;
    }

    /** Whether the other side has neither sent anything nor closed the connection. */
    bool isSilent() const {
        pollfd readable{descriptor, POLLIN, 0};
        return ::poll(&readable, 1, 0) == 0;
    }

private:
    int descriptor;
};

/** Connects to a port of the loopback interface. */
inline Socket connectTo(std::uint16_t port) {
    Socket client(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(port);
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    EXPECT_EQ(::connect(client.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
    return client;
}

/** Both ends of a TCP connection. */
class TcpPair {
public:
    TcpPair() : TcpPair(Socket(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0))) {}

    Socket client;
    Socket server;

private:
    explicit TcpPair(Socket listening)
        : client(connectTo(bound(listening))), server(::accept(listening.get(), nullptr, nullptr)) {}

    static std::uint16_t bound(const Socket& listening) {
        sockaddr_in address{};
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        socklen_t size = sizeof address;
        auto* const pointer = reinterpret_cast<sockaddr*>(&address);
        EXPECT_EQ(::bind(listening.get(), pointer, size), 0);
        EXPECT_EQ(::listen(listening.get(), 1), 0);
        EXPECT_EQ(::getsockname(listening.get(), pointer, &size), 0);
        return ntohs(address.sin_port);
    }
};

}  // namespace cimhost::server::test
