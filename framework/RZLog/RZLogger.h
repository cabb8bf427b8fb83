#pragma once

#include <string>

#include "Export.h"

namespace RZLog {

/**
 * The agent's log. It has two channels, log and trace. Each logger has one level per channel; a record is written if
 * its level does not exceed the logger's. Thread-safe. Never throws, and never writes to the standard streams unless
 * configured to.
 */
class KO_EXPORT RZLogger {
public:
    /**
     * Writes one record to the log channel.
     * @param function plain name of the reporting function
     * @param file name of the source file
     * @param line line number in the source file
     * @param logger name of the logger, for example "Tarvik.LeaseAndWarrantyProvider"
     * @param level 3000 error, 4000 trace of control flow, 6000 detail
     * @param extra reserved, like the two numbers after it: pass null, 0, 0
     * @param text the message; the log escapes control characters
     */
    static void logLevelMessage(const char* function, const char* file, int line, const std::string& logger, int level,
                                char* extra, int, int, const std::string& text);

    /** Writes one record to the trace channel. Otherwise like logLevelMessage. */
    static void traceLevelMessage(const char* function, const char* file, int line, const std::string& logger,
                                  int level, char* extra, int, int, const std::string& text);

    /**
     * Returns whether at least one of the channels may write a record of this level. If not, callers can omit the
     * record and its formatting. Fast, and never throws.
     *
     * The function is optional: it is declared weak, so callers must check that its address is not null.
     */
    static bool admits(const std::string& logger, int level) noexcept __attribute__((weak));
};

}  // namespace RZLog
