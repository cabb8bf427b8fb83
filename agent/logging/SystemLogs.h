#pragma once

#include "logging/Sinks.h"

#include <memory>
#include <string>

namespace RZLog {

/**
 * The sinks of the system log and of systemd's journal. Each sends a datagram a record to the service's socket, itself:
 * the functions that libraries have for it wait for a service that does not read. A record that the service does not
 * take at once, or that finds none, is dropped. They are counted, and told of before the next record that is taken.
 * What is longer than longestText is cut there.
 *
 * @param settings say whether the library's own logger is to tell of it
 * @param socketPath the service's socket, which is looked for with each record
 * @throws std::system_error when this process can have no socket
 */
///@{
std::unique_ptr<Sink> openSystemLog(const LogSettings& settings, const std::string& socketPath = "/dev/log");
std::unique_ptr<Sink> openJournal(const LogSettings& settings,
                                  const std::string& socketPath = "/run/systemd/journal/socket");
///@}

/** Bytes of a record's text that surely fit into a datagram. */
constexpr std::size_t longestText = 100000;

}  // namespace RZLog
