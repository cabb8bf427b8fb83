#pragma once

#include "logging/Record.h"

namespace RZLog {

/**
 * The levels up to which the channels write a logger's records. The first call in the process reads the configuration.
 * Where it names no destination, nothing is written.
 */
const ChannelLevels& levelsOf(std::string_view logger);

/** The highest level of all that levelsOf gives; the highest there is while the configuration has not been read. */
int highestLevel() noexcept;

/**
 * Writes a record to the configured destination. A destination that fails loses the record and is
 * opened anew some seconds later. After the library's static objects have gone, records are dropped.
 */
void write(const Record& record) noexcept;

}  // namespace RZLog
