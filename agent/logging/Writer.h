#pragma once

#include "logging/Record.h"

namespace RZLog {

/**
 * The highest levels that the channels write for a logger. The first call in the process reads the configuration. If it
 * has no destination, nothing is written.
 */
const ChannelLevels& levelsOf(std::string_view logger);

/** The highest level that levelsOf returns for any logger; the maximum until the configuration is read. */
int highestLevel() noexcept;

/**
 * Writes a record to the configured destination. If that fails, drops the record and reopens the destination some
 * seconds later. Drops records after the library's static objects are destroyed.
 */
void write(const Record& record) noexcept;

}  // namespace RZLog
