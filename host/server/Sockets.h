#pragma once

#include <sys/socket.h>

#include <cstddef>
#include <cstdint>
#include <string>

#include "server/Settings.h"

namespace cimhost::server {

/** Connections that a listener may have besides the limit: those that are being ended for new ones. */
constexpr std::size_t endingConnections = 128;

/** Opens a listening socket. @throws SettingsError if the address cannot be used */
int openSocket(const Listener& listener);

/**
 * Raises the limit of open files of this process as far as that is permitted.
 * @throws SettingsError if it remains below the number that the connections need
 */
void requireOpenFiles(std::size_t connections, std::size_t listeners);

/** The port of a listening socket. */
std::uint16_t portOf(int socket);

/** Address and port of a client. */
std::string addressText(const sockaddr* address);

/** The part of a client's address that limits apply to: an IPv4 address, or the first 64 bits of an IPv6 address. */
std::string networkOf(const sockaddr* address);

/** Number of bytes that a TCP socket has received. */
std::uint64_t bytesReceived(int socket);

/** Number of received bytes that have not been read. */
std::uint64_t bytesUnread(int socket);

/** Number of bytes that the peer of a TCP socket has acknowledged. */
std::uint64_t bytesAcknowledged(int socket);

/**
 * Reads and drops what a client still sends after the last response, for a short time: unread data would reset the
 * connection when it is closed, and the client could lose the response.
 */
void discardInput(int socket, std::size_t most);

/**
 * Waits for input without sleeping, for the time in which a client usually sends its next request. It is about as long
 * as it takes to put a thread to sleep and wake it. Does not yield the processor: other programs could use it for
 * milliseconds.
 */
void awaitInputBriefly(int socket);

}  // namespace cimhost::server
