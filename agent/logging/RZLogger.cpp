#include "RZLog/RZLogger.h"

#include "logging/Writer.h"

#include <cerrno>

namespace RZLog {

namespace {

std::string_view orEmpty(const char* text) {
    return text != nullptr ? text : "";
}

/** Whoever logs an error of the system still wants to look at errno afterwards. */
class ErrnoKeeper {
public:
    ErrnoKeeper() : kept(errno) {}
    ~ErrnoKeeper() { errno = kept; }
    ErrnoKeeper(const ErrnoKeeper&) = delete;
    ErrnoKeeper& operator=(const ErrnoKeeper&) = delete;

private:
    int kept;
};

void writeIfAdmitted(const Record& record) noexcept {
    const ErrnoKeeper keeper;
    try {
        if (admits(record.channel, record.logger, record.level)) {
            write(record);
        }
    } catch (...) {  // the configuration did not fit into memory: the next call tries again
    }
}

}  // namespace

void RZLogger::logLevelMessage(const char* function, const char* file, int line, const std::string& logger, int level,
                               char* /*extra*/, int, int, const std::string& text) {
    writeIfAdmitted({Channel::log, level, logger, orEmpty(function), orEmpty(file), line, text});
}

void RZLogger::traceLevelMessage(const char* function, const char* file, int line, const std::string& logger, int level,
                                 char* /*extra*/, int, int, const std::string& text) {
    writeIfAdmitted({Channel::trace, level, logger, orEmpty(function), orEmpty(file), line, text});
}

}  // namespace RZLog
