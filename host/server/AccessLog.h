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

/** Formats a record as a line: time, client, user, operation, class, statuses, number of objects, milliseconds. */
std::string formatted(const AccessRecord& record, std::chrono::system_clock::time_point time);

/** Writes lines to a file, or to standard error, which the service manager stores in the journal. */
class AccessLog {
public:
    /** @param itsFile empty for standard error @throws std::system_error if the file cannot be opened */
    explicit AccessLog(std::filesystem::path itsFile);
    ~AccessLog();
    AccessLog(const AccessLog&) = delete;
    AccessLog& operator=(const AccessLog&) = delete;

    /** Reopens the file after a log rotation. If it cannot be opened, the log continues to use the old file. */
    void reopen();

    /** Writes each line with one system call, so that concurrent lines do not mix. Drops lines if writing fails. */
    void write(const AccessRecord& record) const;
    void write(const std::string& message) const;

private:
    void writeLine(std::string line) const;

    std::filesystem::path file;
    int descriptor;
};

}  // namespace cimhost::server
