#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <regex>
#include <string>
#include <vector>

#include "support/AgentEnvironment.h"

/** Helpers for the tests of the provider's classes. */
namespace providerTest {

using agentEnvironment::LogRecord;

/** The source file of the entry points, and the line before and after each request in the log. */
constexpr const char* entryFile = "LeaseAndWarrantyProvider.cpp";
inline const std::string rule(78, '=');

inline std::string contentOf(const std::filesystem::path& file) {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
}

inline void write(const std::filesystem::path& file, const std::string& content) {
    std::ofstream(file, std::ios::binary) << content;
}

/** Creates a directory at the path, which even the superuser cannot open as a file. */
inline void blockWithDirectory(const std::filesystem::path& file) {
    std::filesystem::remove_all(file);
    std::filesystem::create_directory(file);
}

/**
 * Returns the message of the exception that an operation throws; empty if it throws none. Propagates other exception
 * classes.
 */
template <class Exception, class Operation>
std::string thrown(Operation operation) {
    try {
        operation();
    } catch (const Exception& failure) {
        return failure.what();
    }
    return {};
}

/**
 * Returns whether a cursor has a current object. The cursor's operator bool can move the cursor, so test assertions
 * cannot call it.
 */
template <class Cursor>
bool hasCurrent(Cursor& cursor) {
    return cursor;
}

/** Replaces line numbers in a trace message with N. */
inline std::string withoutLine(const std::string& text) {
    static const std::regex number("(\\[Line: |, Line: |at line )[0-9]+");
    return std::regex_replace(text, number, "$1N");
}

/** Returns the messages of a channel's records in order, without line numbers. */
inline std::vector<std::string> logMessages(const std::string& channel = "log") {
    std::vector<std::string> found;
    for (const LogRecord& record : agentEnvironment::log()) {
        if (record.channel == channel) {
            found.push_back(withoutLine(record.text));
        }
    }
    return found;
}

/** Returns the records of a channel that a function of a source file wrote. */
inline std::vector<LogRecord> recordsOf(const std::string& file, const std::string& function,
                                        const std::string& channel = "log") {
    std::vector<LogRecord> found;
    for (const LogRecord& record : agentEnvironment::log()) {
        if (record.channel == channel && record.file == file && record.function == function) {
            found.push_back(record);
        }
    }
    return found;
}

/** Returns the messages of the records of a function, without line numbers. */
inline std::vector<std::string> logMessagesOf(const std::string& file, const std::string& function) {
    std::vector<std::string> found;
    for (const LogRecord& record : recordsOf(file, function)) {
        found.push_back(withoutLine(record.text));
    }
    return found;
}

/**
 * Returns the messages that a function of a source file logs during an operation. Expects the provider's logger, the
 * flow level and a line number.
 */
template <class Operation>
std::vector<std::string> flowLoggedBy(const std::string& file, const std::string& function, Operation operation) {
    agentEnvironment::forgetLog();
    operation();
    for (const LogRecord& record : recordsOf(file, function)) {
        EXPECT_EQ(record.logger, "Tarvik.LeaseAndWarrantyProvider");
        EXPECT_EQ(record.level, 4000);
        EXPECT_GT(record.line, 0);
    }
    return logMessagesOf(file, function);
}

/** Return the entry and exit messages of a function. A parameter list must start with a space. */
inline std::string entering(const std::string& function, const std::string& file, const std::string& list = {}) {
    return "ENTERING: " + function + "() in " + file + " [Line: N]" +
           (list.empty() ? std::string() : ",Parameters List: " + list);
}

inline std::string exiting(const std::string& function, const std::string& file, const std::string& list = {}) {
    return "EXITING: " + function + "() in " + file + " [Line: N]" +
           (list.empty() ? std::string() : ",Parameters List: " + list);
}

inline std::string variable(const std::string& name, const std::string& value, const std::string& file) {
    return "VARIABLE: '" + name + "' has Value '" + value + "' at line N in " + file;
}

inline std::string message(const std::string& text, const std::string& file) {
    return "MESSAGE [File: " + file + ", Line: N]: " + text;
}

/** Provides an empty data directory and an empty log for each test. */
class CleanAgent : public testing::Test {
protected:
    void SetUp() override { agentEnvironment::clear(); }
    void TearDown() override { agentEnvironment::clear(); }
};

}  // namespace providerTest
