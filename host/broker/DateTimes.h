#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace cimhost {

/** Whether the text of a CIM datetime is an interval. */
bool isInterval(const std::string& text);

/**
 * Microseconds since 1970-01-01 00:00 UTC, or of the interval; negative before 1970. None when fields of the text
 * are unknown (asterisks).
 * @param text a valid CIM datetime
 */
std::optional<std::int64_t> microseconds(const std::string& text);

/** The time as a CIM datetime in UTC; none when its year has not four digits. */
std::optional<std::string> timeText(std::int64_t microseconds);

/** The interval as a CIM datetime; none when its days have more than eight digits. */
std::optional<std::string> intervalText(std::uint64_t microseconds);

/** The time now as a CIM datetime in UTC. */
std::string currentTimeText();

}  // namespace cimhost
