#include "logging/Writer.h"

#include <atomic>
#include <chrono>
#include <limits>
#include <mutex>
#include <type_traits>

#include "logging/LogSettings.h"
#include "logging/Sinks.h"

namespace RZLog {

namespace {

constexpr std::chrono::seconds pauseAfterFailure{10};

std::atomic<int> ceiling{std::numeric_limits<int>::max()};

/** The destination and its settings. */
struct Output {
    LogSettings settings;
    std::unique_ptr<Sink> sink;
    std::chrono::steady_clock::time_point nextOpening = std::chrono::steady_clock::time_point::min();
};

// A thread may log while static objects are destroyed at exit. It uses only the mutex and the pointer then, which need
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

/** Opens the destination of the settings. @return null if there is none  @throws std::exception on failure */
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

void reportProblems(const Agent::Problems& problems, const Levels& levels) {
    for (const std::string& problem : problems) {
        for (const Channel channel : {Channel::log, Channel::trace}) {
            if (levels.admit(channel, ownLogger, errorLevel)) {
                write({channel, errorLevel, ownLogger, "configure", "Writer.cpp", __LINE__, problem});
            }
        }
    }
}

/** Admits nothing, so that callers do not format records that are not written. */
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
    ceiling = levels.highest();
    return levels;
}

}  // namespace

const ChannelLevels& levelsOf(std::string_view logger) {
    static_assert(std::is_trivially_destructible_v<Levels>, "levels are read while static objects are destroyed");
    static const Levels levels = configure();
    return levels.of(logger);
}

int highestLevel() noexcept {
    return ceiling.load(std::memory_order_relaxed);
}

void write(const Record& record) noexcept {
    const std::lock_guard<std::mutex> lock(outputMutex);
    if (output != nullptr) {
        writeUnlessFailing(record);
    }
}

}  // namespace RZLog
