#pragma once

#include "logging/LogSettings.h"
#include "logging/Record.h"

#include <memory>

namespace RZLog {

/** Writes records to a destination. Not thread-safe. */
class Sink {
public:
    Sink() = default;
    Sink(const Sink&) = delete;
    Sink& operator=(const Sink&) = delete;
    virtual ~Sink() = default;

    /** Writes one record. A later crash of the process does not lose it. @throws std::exception on failure */
    virtual void write(const Record& record) = 0;
};

/**
 * Opens the destination of the settings.
 * @return null if there is none
 * @throws std::exception if it cannot be opened
 */
std::unique_ptr<Sink> openSink(const LogSettings& settings);

}  // namespace RZLog
