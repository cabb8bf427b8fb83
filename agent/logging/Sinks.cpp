#include "logging/Sinks.h"

#include "logging/SystemLogs.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <system_error>

#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wconversion"
#pragma GCC diagnostic ignored "-Wshadow"
#pragma GCC diagnostic ignored "-Wpedantic"
#include <spdlog/pattern_formatter.h>
#include <spdlog/sinks/rotating_file_sink.h>
#pragma GCC diagnostic pop

namespace RZLog {

namespace {

constexpr mode_t fileMode = 0640;

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
        // Else the file would be opened all the same: made for everybody to read, with its directory; or a pipe.
        events.before_open = [](const std::string& path) {
            if (!prepareFile(path)) {
                throw std::system_error(std::make_error_code(std::errc::io_error));
            }
        };
        return events;
    }

    spdlog::sinks::rotating_file_sink_st file;
};

}  // namespace

std::unique_ptr<Sink> openSink(const LogSettings& settings) {
    switch (settings.destination) {
        case LogSettings::Destination::file:
            return std::make_unique<FileSink>(settings);
        case LogSettings::Destination::syslog:
            return openSystemLog(settings);
        case LogSettings::Destination::journal:
            return openJournal(settings);
        case LogSettings::Destination::none:
            break;
    }
    return nullptr;
}

}  // namespace RZLog
