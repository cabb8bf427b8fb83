#include "broker/DateTimes.h"

#include <chrono>
#include <cstdio>
#include <ctime>
#include <utility>

#include "cim/DateTime.h"

namespace cimhost {
namespace {

constexpr std::int64_t microsecondsInSecond = 1'000'000;

int number(const std::string& dateTime, std::size_t position, std::size_t length) {
    return std::stoi(dateTime.substr(position, length));
}

std::int64_t secondsOfInterval(const std::string& dateTime) {
    const std::int64_t hours = std::int64_t{24} * number(dateTime, 0, 8) + number(dateTime, 8, 2);
    return (60 * hours + number(dateTime, 10, 2)) * 60 + number(dateTime, 12, 2);
}

std::int64_t secondsOfTime(const std::string& dateTime) {
    std::tm time{};
    time.tm_year = number(dateTime, 0, 4) - 1900;
    time.tm_mon = number(dateTime, 4, 2) - 1;
    time.tm_mday = number(dateTime, 6, 2);
    time.tm_hour = number(dateTime, 8, 2);
    time.tm_min = number(dateTime, 10, 2);
    time.tm_sec = number(dateTime, 12, 2);
    return std::int64_t{timegm(&time)} - std::int64_t{60} * number(dateTime, 21, 4);
}

}  // namespace

bool isIntervalForm(const std::string& dateTime) {
    return dateTime.size() == cim::noDate.size() && dateTime[21] == ':';
}

std::optional<std::int64_t> microsecondsOf(const std::string& dateTime) {
    if (dateTime.size() != cim::noDate.size() || dateTime.find('*') != std::string::npos) {
        return std::nullopt;
    }
    const std::int64_t seconds = isIntervalForm(dateTime) ? secondsOfInterval(dateTime) : secondsOfTime(dateTime);
    return seconds * microsecondsInSecond + number(dateTime, 15, 6);
}

std::optional<std::string> formatTime(std::int64_t microseconds) {
    std::int64_t fraction = microseconds % microsecondsInSecond;
    if (fraction < 0) {
        fraction += microsecondsInSecond;
    }
    const std::int64_t seconds = (microseconds - fraction) / microsecondsInSecond;
    std::string formatted = cim::formatPointInTime(seconds, 0, static_cast<int>(fraction));
    return formatted.empty() ? std::nullopt : std::optional(std::move(formatted));
}

std::optional<std::string> formatInterval(std::uint64_t microseconds) {
    const std::uint64_t seconds = microseconds / microsecondsInSecond;
    const std::uint64_t days = seconds / 86400;
    if (days > 99'999'999) {
        return std::nullopt;
    }
    char formatted[64];
    std::snprintf(formatted, sizeof formatted, "%08u%02u%02u%02u.%06u:000", static_cast<unsigned>(days),
                  static_cast<unsigned>(seconds / 3600 % 24), static_cast<unsigned>(seconds / 60 % 60),
                  static_cast<unsigned>(seconds % 60), static_cast<unsigned>(microseconds % microsecondsInSecond));
    return formatted;
}

std::string formatCurrentTime() {
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    return formatTime(std::chrono::duration_cast<std::chrono::microseconds>(now).count()).value_or(std::string{});
}

}  // namespace cimhost
