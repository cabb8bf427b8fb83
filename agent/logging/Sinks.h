#pragma once

#include "logging/LogSettings.h"
#include "logging/Record.h"

#include <memory>

namespace RZLog {

/** Where records go. Its writing may throw; it is not safe for several threads. */
class Sink {
public:
    Sink() = default;
    Sink(const Sink&) = delete;
    Sink& operator=(const Sink&) = delete;
    virtual ~Sink() = default;

    /** Writes one record, so that it survives the process from here on. */
    virtual void write(const Record& record) = 0;
};

/**
 * Opens the destination of the settings.
 * @return null when there is none
 * @throws std::exception when it cannot be opened
 */
std::unique_ptr<Sink> openSink(const LogSettings& settings);

}  // namespace RZLog
