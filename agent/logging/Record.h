#pragma once

#include <chrono>
#include <string>
#include <string_view>

namespace RZLog {

/** The name of the logger of the agent's libraries. */
constexpr const char* ownLogger = "Ostrel.Agent";

/** The level of errors. */
constexpr int errorLevel = 3000;

/** The two channels of the log. */
enum class Channel { log, trace };

/** One record. Does not own its strings. */
struct Record {
    Channel channel = Channel::log;
    int level = 0;
    std::string_view logger;
    std::string_view function;
    std::string_view file;
    int line = 0;
    std::string_view text;
};

/** The record's line in a log file, without line end: eight fields, separated by tabs. */
std::string fileLine(const Record& record, std::chrono::system_clock::time_point time);

/** The record's line for a system log, without the time, which the log adds. */
std::string systemLogLine(const Record& record);

/**
 * Appends a field to a line, escaped so that no content ends the field or the record. Tab, line feed, carriage return
 * and backslash become \t, \n, \r and \\; each byte of another control character, and each byte that is not part of
 * valid UTF-8, becomes \xNN.
 */
void appendEscaped(std::string& line, std::string_view field);

}  // namespace RZLog
