#include "logging/Sinks.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <syslog.h>
#include <unistd.h>

#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wconversion"
#pragma GCC diagnostic ignored "-Wshadow"
#pragma GCC diagnostic ignored "-Wpedantic"
#include <spdlog/pattern_formatter.h>
#include <spdlog/sinks/rotating_file_sink.h>
#include <spdlog/sinks/systemd_sink.h>
#pragma GCC diagnostic pop

namespace RZLog {

namespace {

constexpr int errorLevel = 3000;
constexpr mode_t fileMode = 0640;

bool isError(const Record& record) {
    return record.level <= errorLevel;
}

/**
 * Makes sure that a log file is there, with a mode that keeps clients' data from everybody, and that
 * it is an ordinary file: opening a pipe would wait for its reader, and a terminal would show it.
 */
bool prepareFile(const std::string& path) {
    const int file = ::open(path.c_str(), O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC | O_NONBLOCK | O_NOCTTY, fileMode);
    if (file < 0) {
        return false;
    }
    struct stat status {};
    const bool ordinary = ::fstat(file, &status) == 0 && S_ISREG(status.st_mode);
    ::close(file);
    return ordinary;
}

class FileSink : public Sink {
public:
    explicit FileSink(const LogSettings& settings)
        : file(settings.file, settings.rotationSize, settings.rotationCount, false, handlers()) {
        file.set_formatter(
            std::make_unique<spdlog::pattern_formatter>("%v", spdlog::pattern_time_type::utc, std::string("\n")));
    }

    void write(const Record& record) override {
        const std::string line = fileLine(record, std::chrono::system_clock::now());
        file.log(spdlog::details::log_msg("", spdlog::level::info, line));
        file.flush();
    }

private:
    static spdlog::file_event_handlers handlers() {
        spdlog::file_event_handlers events;
        events.before_open = [](const std::string& path) { prepareFile(path); };
        return events;
    }

    spdlog::sinks::rotating_file_sink_st file;
};

/** Without openlog and closelog: identity and options of the system log are the host process's. */
class SyslogSink : public Sink {
public:
    void write(const Record& record) override {
        const std::string line = systemLogLine(record);
        ::syslog(LOG_DAEMON | (isError(record) ? LOG_ERR : LOG_DEBUG), "%s", line.c_str());
    }
};

class JournalSink : public Sink {
public:
    void write(const Record& record) override {
        const std::string line = systemLogLine(record);
        journal.log(spdlog::details::log_msg("ostrel-agent",
                                             isError(record) ? spdlog::level::err : spdlog::level::debug, line));
    }

private:
    spdlog::sinks::systemd_sink_st journal;
};

}  // namespace

std::unique_ptr<Sink> openSink(const LogSettings& settings) {
    switch (settings.destination) {
        case LogSettings::Destination::file:
            return prepareFile(settings.file) ? std::make_unique<FileSink>(settings) : nullptr;
        case LogSettings::Destination::syslog:
            return std::make_unique<SyslogSink>();
        case LogSettings::Destination::journal:
            return std::make_unique<JournalSink>();
        case LogSettings::Destination::none:
            break;
    }
    return nullptr;
}

}  // namespace RZLog
