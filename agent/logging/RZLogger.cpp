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
        if (record.level <= levelsOf(record.logger).of(record.channel)) {
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

bool RZLogger::admits(const std::string& logger, int level) noexcept {
    if (level > highestLevel()) {  // nearly always: most records are asked about, and never written
        return false;
    }
    const ErrnoKeeper keeper;
    try {
        return level <= levelsOf(logger).highest();
    } catch (...) {
        return true;
    }
}

}  // namespace RZLog
