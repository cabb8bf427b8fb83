#pragma once

#include <cstdint>
#include <optional>
#include <string>

// CIM datetimes as numbers of microseconds.

namespace cimhost {

/** Whether a CIM datetime, with asterisks or without, is an interval. */
bool isIntervalForm(const std::string& dateTime);

/**
 * Microseconds since 1970-01-01 00:00 UTC, or of the interval; negative before 1970. None if fields are unknown
 * (asterisks).
 * @param dateTime a valid CIM datetime
 */
std::optional<std::int64_t> microsecondsOf(const std::string& dateTime);

/** A point in time as CIM datetime in UTC; none if the year is not in 0 to 9999. */
std::optional<std::string> formatTime(std::int64_t microseconds);

/** An interval as CIM datetime; none if its days have more than eight digits. */
std::optional<std::string> formatInterval(std::uint64_t microseconds);

/** The current time as CIM datetime in UTC. */
std::string formatCurrentTime();

}  // namespace cimhost
