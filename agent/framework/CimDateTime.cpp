#include "framework/CimDateTime.h"

#include <cstdio>
#include <ctime>

namespace KO {

namespace {

/** The shape of a datetime: 'd' stands for a digit, 's' for a sign, anything else for itself. */
constexpr std::string_view pointInTimeShape = "dddddddddddddd.ddddddsddd";
constexpr std::string_view intervalShape = "dddddddddddddd.dddddd:000";

bool fits(char character, char shape) {
    switch (shape) {
        case 'd':
            return character >= '0' && character <= '9';
        case 's':
            return character == '+' || character == '-';
        default:
            return character == shape;
    }
}

bool hasShape(std::string_view text, std::string_view shape) {
    if (text.size() != shape.size()) {
        return false;
    }
    for (std::size_t index = 0; index < shape.size(); ++index) {
        if (!fits(text[index], shape[index])) {
            return false;
        }
    }
    return true;
}

int numberAt(std::string_view text, std::size_t position, std::size_t length) {
    int number = 0;
    for (const char digit : text.substr(position, length)) {
        number = number * 10 + (digit - '0');
    }
    return number;
}

int daysOfMonth(int year, int month) {
    constexpr int days[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    const bool leapYear = (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
    return month == 2 && leapYear ? 29 : days[month - 1];
}

bool isDay(int year, int month, int day) {
    return month >= 1 && month <= 12 && day >= 1 && day <= daysOfMonth(year, month);
}

/** Hours, minutes and seconds stand at the same place in a point in time and in an interval. */
bool hasTimeOfDay(std::string_view text) {
    return numberAt(text, 8, 2) < 24 && numberAt(text, 10, 2) < 60 && numberAt(text, 12, 2) < 60;
}

}  // namespace

bool isPointInTime(std::string_view text) {
    return hasShape(text, pointInTimeShape) &&
           isDay(numberAt(text, 0, 4), numberAt(text, 4, 2), numberAt(text, 6, 2)) && hasTimeOfDay(text);
}

bool isInterval(std::string_view text) {
    return hasShape(text, intervalShape) && hasTimeOfDay(text);
}

std::string pointInTimeText(std::int64_t seconds, int offset) {
    std::int64_t shifted = 0;
    if (offset < -999 || offset > 999 || __builtin_add_overflow(seconds, offset * 60, &shifted)) {
        return {};
    }
    const std::time_t local = shifted;
    std::tm fields{};
    if (::gmtime_r(&local, &fields) == nullptr || fields.tm_year < -1900 || fields.tm_year > 9999 - 1900) {
        return {};
    }
    char text[80];
    const int length = std::snprintf(text, sizeof text, "%04d%02d%02d%02d%02d%02d.000000%c%03d", fields.tm_year + 1900,
                                     fields.tm_mon + 1, fields.tm_mday, fields.tm_hour, fields.tm_min, fields.tm_sec,
                                     offset < 0 ? '-' : '+', offset < 0 ? -offset : offset);
    return {text, static_cast<std::size_t>(length)};
}

}  // namespace KO
