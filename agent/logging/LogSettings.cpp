#include "logging/LogSettings.h"

#include <algorithm>
#include <limits>

namespace RZLog {

namespace {

void readDestination(Agent::TableReader& table, LogSettings& settings) {
    const std::string text = table.nonEmptyString("destination").value_or("none");
    if (text == "none") {
        return;
    }
    if (text == "syslog") {
        settings.destination = LogSettings::Destination::syslog;
    } else if (text == "journal") {
        settings.destination = LogSettings::Destination::journal;
    } else if (text.front() == '/' && text.find('\0') == std::string::npos) {
        settings.destination = LogSettings::Destination::file;
        settings.file = text;
    } else {
        table.reject("destination", "must be an absolute path, \"syslog\", \"journal\" or \"none\"");
    }
}

ChannelLevels readLevels(Agent::TableReader& table, ChannelLevels defaults) {
    constexpr int highest = std::numeric_limits<int>::max();
    ChannelLevels levels;
    levels.log = static_cast<int>(table.number("log_level", 0, highest).value_or(defaults.log));
    levels.trace = static_cast<int>(table.number("trace_level", 0, highest).value_or(defaults.trace));
    return levels;
}

void readLogger(Agent::TableReader& table, ChannelLevels defaults, Levels& levels) {
    const std::optional<std::string> name = table.nonEmptyString("name");
    const ChannelLevels ownLevels = readLevels(table, defaults);
    table.rejectUnknownKeys();
    if (!name) {
        if (!table.has("name")) {
            table.reject("name", "is missing");
        }
    } else if (!levels.set(*name, ownLevels)) {
        table.reject("name", "is too long or one too many");
    }
}

}  // namespace

bool Levels::set(std::string_view logger, ChannelLevels levels) {
    if (count == mostLoggers || logger.size() > longestName) {
        return false;
    }
    Entry& entry = entries[count++];
    std::copy(logger.begin(), logger.end(), entry.name.begin());
    entry.length = logger.size();
    entry.levels = levels;
    return true;
}

int Levels::highest() const {
    int highest = fallback.highest();
    for (std::size_t index = 0; index < count; ++index) {
        highest = std::max(highest, entries[index].levels.highest());
    }
    return highest;
}

const ChannelLevels& Levels::of(std::string_view logger) const {
    const auto* const end = entries.begin() + count;
    const auto* const own = std::find_if(entries.begin(), end, [&](const Entry& entry) {
        return logger == std::string_view(entry.name.data(), entry.length);
    });
    return own != end ? own->levels : fallback;
}

LogSettings readLogSettings(const Agent::Document& document, Agent::Problems& problems) {
    LogSettings settings;
    Agent::TableReader table = document.root(problems).table("log");
    readDestination(table, settings);
    settings.rotationSize = static_cast<std::size_t>(
        table.number("rotation_size", 4096, std::numeric_limits<int>::max()).value_or(10 * 1024 * 1024));
    settings.rotationCount = static_cast<std::size_t>(table.number("rotation_count", 1, 1000).value_or(5));
    const ChannelLevels defaults = readLevels(table, ChannelLevels());
    settings.levels.setDefault(defaults);
    for (Agent::TableReader& logger : table.tables("logger")) {
        readLogger(logger, defaults, settings.levels);
    }
    table.rejectUnknownKeys();
    return settings;
}

}  // namespace RZLog
