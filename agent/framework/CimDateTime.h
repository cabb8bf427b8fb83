#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace KO {

/** The text that stands for no date. */
constexpr std::string_view noDateText = "00000000000000.000000-000";

/**
 * Whether a text is the CIM datetime of a point in time, yyyymmddhhmmss.mmmmmmsutc: a day of the
 * calendar, a time of the day, and an offset from UTC in minutes. All digits must be given; the
 * asterisks of CIM for digits that do not matter are not accepted.
 */
bool isPointInTime(std::string_view text);

/** Whether a text is the CIM datetime of an interval, ddddddddhhmmss.mmmmmm:000. */
bool isInterval(std::string_view text);

/**
 * The CIM datetime text of a moment.
 * @param seconds since 1970-01-01 00:00 UTC
 * @param offset  minutes from UTC in which the moment is told
 * @return the empty text when the moment is not in the years 0 to 9999 or the offset not within 999
 */
std::string pointInTimeText(std::int64_t seconds, int offset);

}  // namespace KO
