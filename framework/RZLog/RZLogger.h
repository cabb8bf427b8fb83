#pragma once

#include "Export.h"

#include <string>

namespace RZLog {

/**
 * The agent's log. It has two channels, log and trace; each logger has a level for each, and a
 * record is written when its level is not above its logger's. May be called from any thread; never
 * throws and never writes to the standard streams unless configured to.
 */
class KO_EXPORT RZLogger {
public:
    /**
     * Writes one record to the log channel.
     * @param function plain name of the function that reports
     * @param file     its source file
     * @param line     and line
     * @param logger   name of the logger, such as "Tarvik.LeaseAndWarrantyProvider"
     * @param level    3000 error, 4000 trace of control flow, 6000 detail
     * @param extra    reserved, like the two numbers after it: pass null, 0, 0
     * @param text     the message; control characters are made visible when it is written
     */
    static void logLevelMessage(const char* function, const char* file, int line, const std::string& logger, int level,
                                char* extra, int, int, const std::string& text);

    /** The same for the trace channel. */
    static void traceLevelMessage(const char* function, const char* file, int line, const std::string& logger,
                                  int level, char* extra, int, int, const std::string& text);

    /**
     * Whether a record of a level may be written to one of the channels. Who is told no may leave the record out:
     * its message need not even be put together. Cheap, and never throws.
     *
     * A logging library may do without this operation: it is declared weak, and who uses it looks first whether
     * its address is null.
     */
    static bool admits(const std::string& logger, int level) noexcept __attribute__((weak));
};

}  // namespace RZLog
