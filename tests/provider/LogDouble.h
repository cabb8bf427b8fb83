#pragma once

#include <string>
#include <vector>

/** Test double of the logging library. Stores all records, regardless of their level. */
namespace logDouble {

/** The message of each record, prefixed with its channel: "log" or "trace". */
extern std::vector<std::string> records;

/** Number of constructed message buffers. */
extern int buffersCreated;

/** Maximum level for which the library admits records, if it provides RZLogger::admits. */
extern int admittedLevel;

}  // namespace logDouble
