#pragma once

#include <string>
#include <vector>

/** A logging library that keeps what it is given, whatever its level. */
namespace logDouble {

/** The text of each record, behind its channel: "log" or "trace". */
extern std::vector<std::string> records;

/** How many message buffers were made. */
extern int buffersMade;

/** The level up to which the library says that it admits records; only where it can tell. */
extern int admittedLevel;

}  // namespace logDouble
