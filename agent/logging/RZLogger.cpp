#include "RZLog/RZLogger.h"

#include "logging/Writer.h"

#include <pthread.h>

#include <cerrno>

namespace RZLog {

namespace {

std::string_view orEmpty(const char* text) {
    return text != nullptr ? text : "";
}

/**
 * Whoever logs an error of the system still wants to look at errno afterwards. And a thread that is cancelled goes on
 * until the record is written: the system unwinds it by what looks like an exception, and no catch may keep that.
 */
class PreserveErrno {
public:
    PreserveErrno() : error(errno) { ::pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &cancelling); }
    ~PreserveErrno() {
        ::pthread_setcancelstate(cancelling, nullptr);
        errno = error;
    }
    PreserveErrno(const PreserveErrno&) = delete;
    PreserveErrno& operator=(const PreserveErrno&) = delete;

private:
    int error;
    int cancelling = PTHREAD_CANCEL_ENABLE;
};

void writeIfAdmitted(const Record& record) noexcept {
    if (record.level > highestLevel()) {
        return;
    }
    const PreserveErrno preserveErrno;
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
    const PreserveErrno preserveErrno;
    try {
        return level <= levelsOf(logger).highest();
    } catch (...) {
        return true;
    }
}

}  // namespace RZLog
