#include <algorithm>
#include <optional>

#include "schema/Text.h"

namespace cimhost {
namespace {

bool isDigit(char c) {
    return c >= '0' && c <= '9';
}

bool all(std::string_view text, char c) {
    return std::all_of(text.begin(), text.end(), [&](char each) { return each == c; });
}

/** The number that the digits are; none when they are asterisks. */
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

/** Whether the text is fields of these widths, of digits up to some field and of asterisks from there on. */
bool areFields(std::string_view text, std::initializer_list<std::size_t> widths) {
    bool known = true;
    for (const std::size_t width : widths) {
        const std::string_view field = text.substr(0, width);
        text.remove_prefix(width);
        known = known && !all(field, '*');
        if (known ? !std::all_of(field.begin(), field.end(), isDigit) : !all(field, '*')) {
            return false;
        }
    }
    return true;
}

bool isFraction(std::string_view digits) {
    const auto end = std::find_if_not(digits.begin(), digits.end(), isDigit);
    return all(digits.substr(static_cast<std::size_t>(end - digits.begin())), '*');
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

bool isDate(std::string_view text) {
    if (!areFields(text, {4, 2, 2, 2, 2, 2}) || !within(text.substr(4, 2), 1, 12)) {
        return false;
    }
    const std::optional<int> year = number(text.substr(0, 4));
    const std::optional<int> month = number(text.substr(4, 2));
    return within(text.substr(6, 2), 1, month && year ? daysIn(*month, *year) : 31);
}

bool isTimeOfDay(std::string_view text) {
    return within(text.substr(0, 2), 0, 23) && within(text.substr(2, 2), 0, 59) && within(text.substr(4, 2), 0, 59);
}

}  // namespace

bool isDateTime(std::string_view text) {
    if (text.size() != 25 || text[14] != '.' || !isFraction(text.substr(15, 6))) {
        return false;
    }
    if (isDigit(text[15]) && !isDigit(text[13])) {
        return false;  // microseconds of an unknown second
    }
    const std::string_view offset = text.substr(22);
    if (text[21] == ':') {
        return offset == "000" && areFields(text, {8, 2, 2, 2}) && isTimeOfDay(text.substr(8));
    }
    return (text[21] == '+' || text[21] == '-') && std::all_of(offset.begin(), offset.end(), isDigit) && isDate(text) &&
           isTimeOfDay(text.substr(8));
}

bool isNoDateTime(std::string_view text) {
    return text == "00000000000000.000000-000" || text == "00000000000000.000000+000";
}

}  // namespace cimhost
