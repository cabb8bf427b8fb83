#include "RZLog/RZLogger.h"

#include <pthread.h>

#include <cerrno>

#include "logging/Writer.h"

namespace RZLog {

namespace {

std::string_view orEmpty(const char* text) {
    return text != nullptr ? text : "";
}

/**
 * Keeps errno for the caller, and disables the cancellation of the thread while a record is written: cancellation
 * unwinds the stack with an exception, which no catch may swallow.
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
    } catch (...) {  // out of memory while reading the configuration: the next call tries again
    }
}

/**
 * Whether a channel admits records of this level; true if that cannot be determined. Not inline, so that the usual
 * case, which does not come here, is cheap.
 */
[[gnu::noinline]] bool mayAdmit(const std::string& logger, int level) noexcept {
    const PreserveErrno preserveErrno;
    try {
        return level <= levelsOf(logger).highest();
    } catch (...) {
        return true;
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
    return level <= highestLevel() && mayAdmit(logger, level);  // most records end at the first comparison
}

}  // namespace RZLog
