#pragma once

#include <sys/socket.h>

#include <cstddef>
#include <cstdint>
#include <string>

#include "server/Settings.h"

namespace cimhost::server {

/** Number of connections per listener beyond the limit, for connections that are being ended for new ones. */
constexpr std::size_t endingConnections = 128;

/** Opens a listening socket. @throws SettingsError if the address cannot be used */
int openSocket(const Listener& listener);

/**
 * Raises this process's limit of open files to the hard limit.
 * @throws SettingsError if the hard limit is lower than the number that the connections need
 */
void requireOpenFiles(std::size_t connections, std::size_t listeners);

/** The port of a listening socket. */
std::uint16_t portOf(int socket);

/** Address and port of a client. */
std::string addressText(const sockaddr* address);

/** The part of a client's address that limits apply to: the IPv4 address, or the first 64 bits of the IPv6 address. */
std::string networkOf(const sockaddr* address);

/** Number of bytes that a TCP socket has received. */
std::uint64_t bytesReceived(int socket);

/** Number of bytes that a socket has received and that have not been read. */
std::uint64_t bytesUnread(int socket);

/** Number of bytes that the peer of a TCP socket has acknowledged. */
std::uint64_t bytesAcknowledged(int socket);

/**
 * Reads and discards, for at most two seconds, the data that a client still sends after the last response. Closing a
 * connection with unread data resets it, and the client could lose the response.
 */
void discardInput(int socket, std::size_t most);

/**
 * Polls for input without sleeping, for about as long as it takes to put a thread to sleep and wake it: a client
 * usually sends its next request within this time. Does not yield the processor, since another program could then use
 * it for milliseconds.
 */
void awaitInputBriefly(int socket);

}  // namespace cimhost::server
