#pragma once

#include "support/AgentEnvironment.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <regex>
#include <string>
#include <vector>

/** What the tests of the provider's units share. */
namespace providerTest {

using agentEnvironment::LogRecord;

inline std::string contentOf(const std::filesystem::path& file) {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
}

inline void write(const std::filesystem::path& file, const std::string& content) {
    std::ofstream(file, std::ios::binary) << content;
}

/** Makes a file that nobody can open, the superuser included. */
inline void blockWithDirectory(const std::filesystem::path& file) {
    std::filesystem::remove_all(file);
    std::filesystem::create_directory(file);
}

/** The text of the exception that an operation throws; empty when it throws none. Other classes pass through. */
template <class Exception, class Operation>
std::string thrown(Operation operation) {
    try {
        operation();
    } catch (const Exception& failure) {
        return failure.what();
    }
    return {};
}

/** Whether a cursor stands on something. Its own operator may move it, which a test assertion forbids. */
template <class Cursor>
bool stands(Cursor& cursor) {
    return cursor;
}

/** A trace text with its line numbers as N, which tests do not depend on. */
inline std::string withoutLine(const std::string& text) {
    static const std::regex number("(\\[Line: |, Line: |at line )[0-9]+");
    return std::regex_replace(text, number, "$1N");
}

/** The texts of one channel's records, without line numbers, in the order written. */
inline std::vector<std::string> texts(const std::string& channel = "log") {
    std::vector<std::string> found;
    for (const LogRecord& record : agentEnvironment::log()) {
        if (record.channel == channel) {
            found.push_back(withoutLine(record.text));
        }
    }
    return found;
}

/** The records of one channel that a function of a unit wrote. */
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

/** Their texts, without line numbers. */
inline std::vector<std::string> textsOf(const std::string& file, const std::string& function) {
    std::vector<std::string> found;
    for (const LogRecord& record : recordsOf(file, function)) {
        found.push_back(withoutLine(record.text));
    }
    return found;
}

/** Entry and exit of a function, as they stand in the log; the list, if any, with its leading blank. */
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

/** An empty data directory and log for each test. */
class CleanAgent : public testing::Test {
protected:
    void SetUp() override { agentEnvironment::clear(); }
    void TearDown() override { agentEnvironment::clear(); }
};

}  // namespace providerTest
