#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace cim {

/** The datetime that represents no date. It has the length of every CIM datetime. */
constexpr std::string_view noDate = "00000000000000.000000-000";

/** Whether a string is noDate, with a plus or minus sign before the offset. */
bool isNoDate(std::string_view string);

/**
 * Whether a string is a CIM datetime: a point in time, yyyymmddhhmmss.mmmmmmsutc, with a day of the calendar, a time of
 * the day and an offset from UTC in minutes; or an interval, ddddddddhhmmss.mmmmmm:000. Asterisks may replace the
 * last fields up to and including the fraction, or only the last digits of the fraction.
 */
bool isDateTime(std::string_view string);

/** Whether a string is the CIM datetime of a point in time without asterisks. */
bool isPointInTime(std::string_view string);

/** Whether a string is the CIM datetime of an interval without asterisks. */
bool isInterval(std::string_view string);

/**
 * Formats a point in time as a CIM datetime.
 * @param seconds      since 1970-01-01 00:00 UTC
 * @param offset       minutes from UTC of the local time to format
 * @param microseconds from 0 to 999999, added to the seconds
 * @return the datetime; empty if the year is not in 0 to 9999 or the offset exceeds 999 minutes
 */
std::string formatPointInTime(std::int64_t seconds, int offset, int microseconds = 0);

}  // namespace cim
