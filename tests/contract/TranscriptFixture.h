#pragma once

#include <string>
#include <vector>

#include "TranscriptScenarios.h"

namespace contract {

/** @name Sources of records */
///@{
constexpr const char* entryUnit = "LeaseAndWarrantyProvider.cpp";
constexpr const char* markerFile = "sdk/kolib/include/Trace.h";  ///< of the marker records
///@}

/** Separator line before and after every request. */
extern const std::string rule;

/** The parsed message of a record. */
struct Line {
    enum Kind { entering, exiting, method, variable, message, requestRule, unknown };
    Kind kind = unknown;
    std::string name{};  ///< of the function or variable
    std::string file{};
    int line = 0;
    std::string value{};  ///< value of the variable, text of the message, or parameter list
};

/** Parses a message. The kind is `unknown` unless the message has one of the formats. */
Line lineOf(const std::string& text);

/** Returns the records of one channel. */
std::vector<LogRecord> channel(const std::vector<LogRecord>& records, const char* name);

/** Checks every transcript, independently of its golden file. */
class TranscriptPropertyTest : public TranscriptTest {
protected:
    /** Calls a check with the records of each scenario, which include both channels. */
    template <class Check>
    void forEachTranscript(Check check) {
        for (const Scenario& scenario : scenarios()) {
            SCOPED_TRACE(scenario.name);
            const auto& records = recordsOf(scenario);
            ASSERT_THAT(records, testing::Not(testing::IsEmpty()));
            check(scenario, records);
        }
    }

    /** Calls a check with each record of the log channel of each scenario. */
    template <class Check>
    void forEachRecord(Check check) {
        forEachTranscript([&](const Scenario&, const std::vector<LogRecord>& records) {
            for (const LogRecord& record : channel(records, "log")) {
                check(record, lineOf(record.text));
            }
        });
    }

    /** Returns the records of a scenario. Runs each scenario once per process. */
    const std::vector<LogRecord>& recordsOf(const Scenario& scenario);

    /** Returns the log channel's records of a scenario. */
    std::vector<LogRecord> logged(const std::string& scenarioName);

    /** Returns the function or variable names of the records with this kind and source file. */
    std::vector<std::string> namesOf(const std::string& scenarioName, Line::Kind kind, const std::string& file);
};

}  // namespace contract
