#pragma once

#include <memory>
#include <string>

#include "logging/LogSettings.h"

namespace RZLog {

/** Writes records to a destination. Not thread-safe. */
class Sink {
public:
    Sink() = default;
    Sink(const Sink&) = delete;
    Sink& operator=(const Sink&) = delete;
    virtual ~Sink() = default;

    /** Writes one record. The record survives a later crash of the process. @throws std::exception on failure */
    virtual void write(const Record& record) = 0;
};

/**
 * Opens the sink that appends each record as one line to the log file of the settings. When a record would make the
 * file larger than the rotation size, the file is renamed and a new file is created.
 * @throws std::system_error if the file cannot be opened or is not a regular file
 */
std::unique_ptr<Sink> openLogFile(const LogSettings& settings);

/**
 * Opens the sink of the system log, or of systemd's journal. The sink sends one datagram per record to the service's
 * socket. It does not use syslog(3) or sd_journal_send(3), which block while the service does not read. If a datagram
 * cannot be sent at once, the record is dropped. Dropped records are counted, and the count is reported before the next
 * record that is sent. A record longer than longestText is truncated.
 *
 * @param settings   the levels; whether dropped records are reported depends on those of the library's own logger
 * @param socketPath the service's socket, looked up for each record
 * @throws std::system_error if no socket can be created
 */
///@{
std::unique_ptr<Sink> openSystemLog(const LogSettings& settings, const std::string& socketPath = "/dev/log");
std::unique_ptr<Sink> openJournal(const LogSettings& settings,
                                  const std::string& socketPath = "/run/systemd/journal/socket");
///@}

/** Maximum number of bytes of a record's line. A datagram of this size can be sent on every system. */
constexpr std::size_t longestText = 100000;

}  // namespace RZLog
