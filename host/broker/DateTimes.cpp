#include "broker/DateTimes.h"

#include <chrono>
#include <cstdio>
#include <ctime>

namespace cimhost {
namespace {

constexpr std::int64_t microsecondsInSecond = 1'000'000;
constexpr std::size_t textLength = 25;

int number(const std::string& text, std::size_t position, std::size_t length) {
    return std::stoi(text.substr(position, length));
}

std::int64_t secondsOfInterval(const std::string& text) {
    const std::int64_t hours = std::int64_t{24} * number(text, 0, 8) + number(text, 8, 2);
    return (60 * hours + number(text, 10, 2)) * 60 + number(text, 12, 2);
}

std::int64_t secondsOfTime(const std::string& text) {
    std::tm time{};
    time.tm_year = number(text, 0, 4) - 1900;
    time.tm_mon = number(text, 4, 2) - 1;
    time.tm_mday = number(text, 6, 2);
    time.tm_hour = number(text, 8, 2);
    time.tm_min = number(text, 10, 2);
    time.tm_sec = number(text, 12, 2);
    return std::int64_t{timegm(&time)} - std::int64_t{60} * number(text, 21, 4);
}

}  // namespace

bool isInterval(const std::string& text) {
    return text.size() == textLength && text[21] == ':';
}

std::optional<std::int64_t> microseconds(const std::string& text) {
    if (text.size() != textLength || text.find('*') != std::string::npos) {
        return std::nullopt;
    }
    const std::int64_t seconds = isInterval(text) ? secondsOfInterval(text) : secondsOfTime(text);
    return seconds * microsecondsInSecond + number(text, 15, 6);
}

std::optional<std::string> timeText(std::int64_t microseconds) {
    std::int64_t fraction = microseconds % microsecondsInSecond;
    if (fraction < 0) {
        fraction += microsecondsInSecond;
    }
    const std::time_t seconds = (microseconds - fraction) / microsecondsInSecond;
    std::tm time{};
    if (gmtime_r(&seconds, &time) == nullptr || time.tm_year < -1900 || time.tm_year > 9999 - 1900) {
        return std::nullopt;
    }
    char text[64];
    std::snprintf(text, sizeof text, "%04d%02d%02d%02d%02d%02d.%06d+000", time.tm_year + 1900, time.tm_mon + 1,
                  time.tm_mday, time.tm_hour, time.tm_min, time.tm_sec, static_cast<int>(fraction));
    return text;
}

std::optional<std::string> intervalText(std::uint64_t microseconds) {
    const std::uint64_t seconds = microseconds / microsecondsInSecond;
    const std::uint64_t days = seconds / 86400;
    if (days > 99'999'999) {
        return std::nullopt;
    }
    char text[64];
    std::snprintf(text, sizeof text, "%08u%02u%02u%02u.%06u:000", static_cast<unsigned>(days),
                  static_cast<unsigned>(seconds / 3600 % 24), static_cast<unsigned>(seconds / 60 % 60),
                  static_cast<unsigned>(seconds % 60), static_cast<unsigned>(microseconds % microsecondsInSecond));
    return text;
}

std::string currentTimeText() {
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    return timeText(std::chrono::duration_cast<std::chrono::microseconds>(now).count()).value_or(std::string{});
}

}  // namespace cimhost
