#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <string>
#include <string_view>

#include "configuration/Document.h"
#include "logging/Record.h"

namespace RZLog {

/** The highest level that each channel writes. */
struct ChannelLevels {
    int log = 3000;
    int trace = 3000;

    int of(Channel channel) const { return channel == Channel::log ? log : trace; }
    int highest() const { return std::max(log, trace); }
};

/**
 * The levels of the loggers. Reading them allocates nothing, takes no lock and works until the library is unloaded,
 * even after static objects are destroyed. For this reason, the sizes are fixed.
 */
class Levels {
public:
    static constexpr std::size_t mostLoggers = 64;
    static constexpr std::size_t longestName = 127;

    /** Sets the levels of all loggers for which set() is not called. */
    void setDefault(ChannelLevels levels) { fallback = levels; }

    /** Sets one logger's levels. @return false if there is no room or the name is too long */
    bool set(std::string_view logger, ChannelLevels levels);

    /** The levels of a logger. */
    const ChannelLevels& of(std::string_view logger) const;

    /** The highest level that any channel of any logger writes. */
    int highest() const;

    /** Whether a channel writes a logger's record of a level. */
    bool admit(Channel channel, std::string_view logger, int level) const { return level <= of(logger).of(channel); }

private:
    struct Entry {
        std::array<char, longestName + 1> name;
        std::size_t length;
        ChannelLevels levels;
    };

    ChannelLevels fallback;
    std::array<Entry, mostLoggers> entries{};
    std::size_t count = 0;
};

/** The [log] table of the agent's configuration. */
struct LogSettings {
    enum class Destination { none, file, syslog, journal };

    Destination destination = Destination::none;
    std::string file;                     ///< path of the log file; empty for the other destinations
    std::size_t rotationSize = 10485760;  ///< bytes after which the file is rotated
    std::size_t rotationCount = 5;        ///< number of rotated files to keep
    Levels levels;
};

/** Reads the [log] table. A setting whose value is absent or invalid has its default. */
LogSettings readLogSettings(const Agent::Document& document, Agent::Problems& problems);

}  // namespace RZLog
