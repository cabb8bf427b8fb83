#pragma once

#include "logging/Sinks.h"

#include <memory>

namespace RZLog {

/**
 * Opens the sink that appends each record as one line to the log file of the settings. When a record would make the
 * file larger than the rotation size, the file is renamed and a new one is begun.
 * @throws std::system_error if the file cannot be opened or is not an ordinary file
 */
std::unique_ptr<Sink> openLogFile(const LogSettings& settings);

}  // namespace RZLog
