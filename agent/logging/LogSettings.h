#pragma once

#include <cstddef>
#include <string>

#include "configuration/Document.h"
#include "logging/Levels.h"

namespace RZLog {

/** The [log] table of the agent's configuration. */
struct LogSettings {
    enum class Destination { none, file, syslog, journal };

    Destination destination = Destination::none;
    std::string file;                     ///< path of the log file; empty for the other destinations
    std::size_t rotationSize = 10485760;  ///< bytes after which the file is rotated
    std::size_t rotationCount = 5;        ///< number of rotated files to keep
    Levels levels;
};

/** Reads the [log] table; absent and wrong values have their defaults. */
LogSettings readLogSettings(const Agent::Document& document, Agent::Problems& problems);

}  // namespace RZLog
