#pragma once

#include <cstdint>
#include <optional>
#include <string>

// CIM datetimes as numbers of microseconds.

namespace cimhost {

/** Whether a CIM datetime, with or without asterisks, is an interval. */
bool isIntervalForm(const std::string& dateTime);

/**
 * The microseconds from 1970-01-01 00:00 UTC to a point in time, negative before 1970; the microseconds of an interval;
 * none if the datetime has asterisks.
 * @param dateTime a valid CIM datetime
 */
std::optional<std::int64_t> microsecondsOf(const std::string& dateTime);

/** A point in time as a CIM datetime in UTC; none if the year is not in 0 to 9999. */
std::optional<std::string> formatTime(std::int64_t microseconds);

/** An interval as a CIM datetime; none if the number of days has more than eight digits. */
std::optional<std::string> formatInterval(std::uint64_t microseconds);

/** The current time as a CIM datetime in UTC. */
std::string formatCurrentTime();

}  // namespace cimhost
