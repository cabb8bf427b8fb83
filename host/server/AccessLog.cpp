#include "server/AccessLog.h"

#include <fcntl.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <ctime>
#include <system_error>

namespace cimhost::server {
namespace {

int openLog(const std::filesystem::path& file) {
    return ::open(file.c_str(), O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0640);
}

/** Formats a string from a client as one word of visible ASCII characters. Escapes other characters. */
std::string word(const std::string& string) {
    if (string.empty()) {
        return "-";
    }
    std::string escaped;
    for (const char each : string.substr(0, 200)) {
        const auto byte = static_cast<unsigned char>(each);
        if (byte > 0x20 && byte < 0x7F && each != '\\') {
            escaped += each;
            continue;
        }
        std::array<char, 8> code{};
        std::snprintf(code.data(), code.size(), "\\x%02x", static_cast<unsigned>(byte));
        escaped += code.data();
    }
    return escaped;
}

std::string utc(std::chrono::system_clock::time_point time) {
    const std::time_t seconds = std::chrono::system_clock::to_time_t(time);
    std::tm parts{};
    ::gmtime_r(&seconds, &parts);
    std::array<char, 32> buffer{};
    std::strftime(buffer.data(), buffer.size(), "%Y-%m-%dT%H:%M:%SZ", &parts);
    return buffer.data();
}

}  // namespace

std::string formatted(const AccessRecord& record, std::chrono::system_clock::time_point time) {
    std::array<char, 32> milliseconds{};
    std::snprintf(milliseconds.data(), milliseconds.size(), "%.3f",
                  static_cast<double>(record.duration.count()) / 1000.0);
    return utc(time) + " " + word(record.client) + " " + word(record.user) + " " + word(record.operation) + " " +
           word(record.className) + " " + std::to_string(record.httpStatus) + "/" + std::to_string(record.cimStatus) +
           " " + std::to_string(record.objects) + " " + milliseconds.data();
}

AccessLog::AccessLog(std::filesystem::path itsFile)
    : file(std::move(itsFile)), descriptor(file.empty() ? ::dup(STDERR_FILENO) : openLog(file)) {
    if (descriptor < 0) {
        throw std::system_error(errno, std::generic_category(),
                                "the access log " + file.string() + " cannot be opened");
    }
}

AccessLog::~AccessLog() {
    ::close(descriptor);
}

void AccessLog::reopen() {
    const int opened = file.empty() ? -1 : openLog(file);
    if (opened >= 0) {
        ::dup3(opened, descriptor, O_CLOEXEC);  // atomic: other threads are writing
        ::close(opened);
    }
}

void AccessLog::write(const AccessRecord& record) const {
    writeLine(formatted(record, std::chrono::system_clock::now()));
}

void AccessLog::write(const std::string& message) const {
    writeLine(utc(std::chrono::system_clock::now()) + " " + message);
}

void AccessLog::writeLine(std::string line) const {
    line += '\n';
    static_cast<void>(::write(descriptor, line.data(), line.size()) < 0);
}

}  // namespace cimhost::server
