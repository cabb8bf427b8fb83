#pragma once

#include <chrono>
#include <cstddef>
#include <filesystem>
#include <string>

namespace cimhost::server {

/** One request, for the access log. Empty strings are written as "-". */
struct AccessRecord {
    std::string client{};  ///< address and port
    std::string user{};
    std::string operation{};
    std::string className{};
    unsigned httpStatus = 0;
    int cimStatus = 0;
    std::size_t objects = 0;
    std::chrono::microseconds duration{};
};

/** A record as a line: time, client, user, operation, class, status, number of objects, milliseconds. */
std::string formatted(const AccessRecord& record, std::chrono::system_clock::time_point time);

/** Writes lines to a file, or to standard error, which the service manager stores in the journal. */
class AccessLog {
public:
    /** @param itsFile empty for standard error @throws std::system_error if the file cannot be opened */
    explicit AccessLog(std::filesystem::path itsFile);
    ~AccessLog();
    AccessLog(const AccessLog&) = delete;
    AccessLog& operator=(const AccessLog&) = delete;

    /** Opens the file again, after a log rotation. A file that cannot be opened leaves the log as it is. */
    void reopen();

    /** Each line is one write, so that concurrent lines do not mix. Lines that cannot be written are dropped. */
    void write(const AccessRecord& record) const;
    void write(const std::string& message) const;

private:
    void writeLine(std::string line) const;

    std::filesystem::path file;
    int descriptor;
};

}  // namespace cimhost::server
