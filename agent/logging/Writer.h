#pragma once

#include "logging/Record.h"

namespace RZLog {

/** Whether the configuration admits a record. The first call in the process reads the configuration. */
bool admits(Channel channel, std::string_view logger, int level);

/**
 * Writes a record to the configured destination. A destination that fails loses the record and is
 * opened anew some seconds later. After the library's static objects have gone, records are dropped.
 */
void write(const Record& record) noexcept;

}  // namespace RZLog
