#include <pthread.h>

#include <atomic>
#include <cerrno>
#include <chrono>
#include <limits>
#include <mutex>
#include <type_traits>

#include "RZLog/RZLogger.h"
#include "logging/Sinks.h"

// The functions of RZLogger. They write records to the configured destination.

namespace RZLog {

namespace {

constexpr std::chrono::seconds pauseAfterFailure{10};

/** The highest level that levelsOf() returns for any logger; the maximum until the configuration is read. */
std::atomic<int> highestLevel{std::numeric_limits<int>::max()};

/** The destination and its settings. */
struct Output {
    LogSettings settings;
    std::unique_ptr<Sink> sink;
    std::chrono::steady_clock::time_point nextOpening = std::chrono::steady_clock::time_point::min();
};

// Threads may log while static objects are destroyed at exit. The mutex and the pointer remain valid, since they need
// no destruction.
std::mutex outputMutex;
Output* output = nullptr;

struct OutputOwner {
    ~OutputOwner() {
        const std::lock_guard<std::mutex> lock(outputMutex);
        delete output;
        output = nullptr;
    }
} outputOwner;

/** Opens the configured destination. @return null if there is none  @throws std::exception on failure */
std::unique_ptr<Sink> openSink(const LogSettings& settings) {
    switch (settings.destination) {
        case LogSettings::Destination::file:
            return openLogFile(settings);
        case LogSettings::Destination::syslog:
            return openSystemLog(settings);
        case LogSettings::Destination::journal:
            return openJournal(settings);
        case LogSettings::Destination::none:
            break;
    }
    return nullptr;
}

Sink* openOutput() {
    const auto now = std::chrono::steady_clock::now();
    if (output->sink == nullptr && now >= output->nextOpening) {
        output->nextOpening = now + pauseAfterFailure;
        output->sink = openSink(output->settings);
    }
    return output->sink.get();
}

void writeUnlessFailing(const Record& record) noexcept {
    try {
        if (Sink* sink = openOutput()) {
            sink->write(record);
        }
    } catch (...) {
        output->sink.reset();
    }
}

/**
 * Writes a record to the configured destination. If that fails, drops the record and closes the destination. Reopens
 * the destination at most every 10 seconds. Drops records after the library's static objects are destroyed.
 */
void write(const Record& record) noexcept {
    const std::lock_guard<std::mutex> lock(outputMutex);
    if (output != nullptr) {
        writeUnlessFailing(record);
    }
}

void reportProblems(const Agent::Problems& problems, const Levels& levels) {
    for (const std::string& problem : problems) {
        for (const Channel channel : {Channel::log, Channel::trace}) {
            if (levels.admit(channel, ownLogger, errorLevel)) {
                write({channel, errorLevel, ownLogger, "configure", "Writer.cpp", __LINE__, problem});
            }
        }
    }
}

/** Levels that admit no record, so that callers do not format records that are not written. */
Levels silence() {
    constexpr int lowest = std::numeric_limits<int>::min();
    Levels levels;
    levels.setDefault({lowest, lowest});
    return levels;
}

Levels configure() {
    Agent::Problems problems;
    const Agent::Document document = Agent::Document::readDefault();
    if (!document.problem().empty()) {
        problems.push_back(document.problem());
    }
    auto newOutput = std::make_unique<Output>();
    newOutput->settings = readLogSettings(document, problems);
    const bool hasDestination = newOutput->settings.destination != LogSettings::Destination::none;
    const Levels levels = hasDestination ? newOutput->settings.levels : silence();
    {
        const std::lock_guard<std::mutex> lock(outputMutex);
        output = newOutput.release();
    }
    reportProblems(problems, levels);
    highestLevel = levels.highest();
    return levels;
}

/**
 * The highest levels that the channels write for a logger. The first call in the process reads the configuration. If
 * the configuration has no destination, the levels admit no record.
 */
const ChannelLevels& levelsOf(std::string_view logger) {
    static_assert(std::is_trivially_destructible_v<Levels>, "levels are read while static objects are destroyed");
    static const Levels levels = configure();
    return levels.of(logger);
}

std::string_view orEmpty(const char* text) {
    return text != nullptr ? text : "";
}

/**
 * Restores errno for the caller, and disables the cancellation of the thread while a record is written. Cancellation
 * unwinds the stack with an exception that `catch (...)` must not swallow.
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
    if (record.level > highestLevel.load(std::memory_order_relaxed)) {
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
 * Whether either channel admits records of this level; true if that cannot be determined. Not inlined, since most calls
 * to admits() return without calling this function.
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
    // For most records, the first comparison is false.
    return level <= highestLevel.load(std::memory_order_relaxed) && mayAdmit(logger, level);
}

}  // namespace RZLog
