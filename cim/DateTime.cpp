#include "cim/DateTime.h"

#include <algorithm>
#include <cstdio>
#include <ctime>
#include <initializer_list>
#include <optional>

namespace cim {
namespace {

/** A function object, so that algorithms inline it. */
constexpr auto isDigit = [](char c) { return c >= '0' && c <= '9'; };

bool all(std::string_view string, char c) {
    return std::all_of(string.begin(), string.end(), [&](char each) { return each == c; });
}

/** The value of a field; none if the field has asterisks. */
std::optional<int> number(std::string_view digits) {
    if (!isDigit(digits.front())) {
        return std::nullopt;
    }
    int value = 0;
    for (const char c : digits) {
        value = 10 * value + (c - '0');
    }
    return value;
}

std::size_t digitCount(std::string_view string) {
    std::size_t count = 0;
    while (count < string.size() && isDigit(string[count])) {
        ++count;
    }
    return count;
}

/** Whether a string consists of digits up to the end of a field, and of asterisks after that. */
bool areFields(std::string_view string, std::initializer_list<std::size_t> ends) {
    const std::size_t known = digitCount(string);
    return all(string.substr(known), '*') && (known == 0 || std::find(ends.begin(), ends.end(), known) != ends.end());
}

bool isFraction(std::string_view digits) {
    return all(digits.substr(digitCount(digits)), '*');
}

bool within(std::string_view digits, int lowest, int highest) {
    const std::optional<int> value = number(digits);
    return !value || (*value >= lowest && *value <= highest);
}

int daysIn(int month, int year) {
    constexpr int days[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    const bool leap = year % 4 == 0 && (year % 100 != 0 || year % 400 == 0);
    return days[month - 1] + (month == 2 && leap ? 1 : 0);
}

bool isDate(std::string_view string) {
    if (!areFields(string.substr(0, 14), {4, 6, 8, 10, 12, 14}) || !within(string.substr(4, 2), 1, 12)) {
        return false;
    }
    const std::optional<int> year = number(string.substr(0, 4));
    const std::optional<int> month = number(string.substr(4, 2));
    return within(string.substr(6, 2), 1, month && year ? daysIn(*month, *year) : 31);
}

bool isTimeOfDay(std::string_view string) {
    return within(string.substr(0, 2), 0, 23) && within(string.substr(2, 2), 0, 59) &&
           within(string.substr(4, 2), 0, 59);
}

}  // namespace

bool isDateTime(std::string_view string) {
    if (string.size() != noDate.size() || string[14] != '.' || !isFraction(string.substr(15, 6))) {
        return false;
    }
    if (isDigit(string[15]) && !isDigit(string[13])) {
        return false;  // microseconds of an unknown second
    }
    const std::string_view offset = string.substr(22);
    if (string[21] == ':') {
        return offset == "000" && areFields(string.substr(0, 14), {8, 10, 12, 14}) && isTimeOfDay(string.substr(8));
    }
    return (string[21] == '+' || string[21] == '-') && std::all_of(offset.begin(), offset.end(), isDigit) &&
           isDate(string) && isTimeOfDay(string.substr(8));
}

bool isNoDate(std::string_view string) {
    return string == noDate || string == "00000000000000.000000+000";
}

bool isPointInTime(std::string_view string) {
    return isDateTime(string) && string[21] != ':' && string.find('*') == std::string_view::npos;
}

bool isInterval(std::string_view string) {
    return isDateTime(string) && string[21] == ':' && string.find('*') == std::string_view::npos;
}

std::string formatPointInTime(std::int64_t seconds, int offset, int microseconds) {
    std::int64_t shifted = 0;
    if (offset < -999 || offset > 999 || __builtin_add_overflow(seconds, offset * 60, &shifted)) {
        return {};
    }
    const std::time_t local = shifted;
    std::tm fields{};
    if (::gmtime_r(&local, &fields) == nullptr || fields.tm_year < -1900 || fields.tm_year > 9999 - 1900) {
        return {};
    }
    char string[80];
    const int length =
        std::snprintf(string, sizeof string, "%04d%02d%02d%02d%02d%02d.%06d%c%03d", fields.tm_year + 1900,
                      fields.tm_mon + 1, fields.tm_mday, fields.tm_hour, fields.tm_min, fields.tm_sec, microseconds,
                      offset < 0 ? '-' : '+', offset < 0 ? -offset : offset);
    return {string, static_cast<std::size_t>(length)};
}

}  // namespace cim
