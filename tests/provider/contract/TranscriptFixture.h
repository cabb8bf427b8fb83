#pragma once

#include "TranscriptScenarios.h"

#include <string>
#include <vector>

namespace contract {

/** @name Where records come from */
///@{
constexpr const char* entryUnit = "LeaseAndWarrantyProvider.cpp";
constexpr const char* markerFile = "sdk/kolib/include/Trace.h";  ///< of the records that mark begin and end
///@}

/** What stands before and behind every request. */
extern const std::string rule;

/** The kind of a record and what its text says. */
struct Line {
    enum Kind { entering, exiting, method, variable, message, requestRule, unknown };
    Kind kind = unknown;
    std::string name{};  ///< of the function or variable
    std::string file{};
    int line = 0;
    std::string value{};  ///< of the variable; the message; the parameter list
};

/** Reads a text; its kind is unknown unless the text has exactly one of the forms. */
Line lineOf(const std::string& text);

/** The records of one channel. */
std::vector<LogRecord> channel(const std::vector<LogRecord>& records, const char* name);

/** Checks that hold for every transcript, whatever its golden file says. */
class TranscriptPropertyTest : public TranscriptTest {
protected:
    /** Runs a check over what each scenario logs, both channels. */
    template <class Check>
    void forEachTranscript(Check check) {
        for (const Scenario& scenario : scenarios()) {
            SCOPED_TRACE(scenario.name);
            const auto& records = recordsOf(scenario);
            ASSERT_THAT(records, testing::Not(testing::IsEmpty()));
            check(scenario, records);
        }
    }

    /** The same over the records of the log channel, one by one. */
    template <class Check>
    void forEachRecord(Check check) {
        forEachTranscript([&](const Scenario&, const std::vector<LogRecord>& records) {
            for (const LogRecord& record : channel(records, "log")) {
                check(record, lineOf(record.text));
            }
        });
    }

    /** What a scenario logs; it is run once in the process. */
    const std::vector<LogRecord>& recordsOf(const Scenario& scenario);

    /** The log channel's records of the scenario of that name. */
    std::vector<LogRecord> logged(const std::string& scenarioName);

    /** The names in those of a kind that come from a file. */
    std::vector<std::string> namesOf(const std::string& scenarioName, Line::Kind kind, const std::string& file);
};

}  // namespace contract
