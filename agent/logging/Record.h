#pragma once

#include "logging/Levels.h"

#include <chrono>
#include <string>
#include <string_view>

namespace RZLog {

/** The logger of the agent's own libraries. */
constexpr const char* ownLogger = "Ostrel.Agent";

/** One record on its way to the log. The texts are borrowed. */
struct Record {
    Channel channel = Channel::log;
    int level = 0;
    std::string_view logger;
    std::string_view function;
    std::string_view file;
    int line = 0;
    std::string_view text;
};

/** The record's line in a log file, without line end: eight fields, tabs between them. */
std::string fileLine(const Record& record, std::chrono::system_clock::time_point time);

/** The record's text for a log that keeps the time itself. One line. */
std::string systemLogLine(const Record& record);

/**
 * Appends a field to a line so that no content can pass for a field's or a record's end. Tab, line
 * feed, carriage return and backslash become \t, \n, \r and \\; every byte of another control
 * character, and every byte that is not part of valid UTF-8, becomes \xNN.
 */
void appendEscaped(std::string& line, std::string_view field);

}  // namespace RZLog
