#include <algorithm>
#include <map>
#include <regex>
#include <set>
#include <tuple>

#include "TranscriptFixture.h"
#include "support/Files.h"

// Format of transcripts: channels, messages, separators around requests, nesting of functions.

namespace contract {
namespace {

TEST_F(TranscriptPropertyTest, EachLogRecordIsFollowedByTheSameTraceRecord) {
    forEachTranscript([](const Scenario&, const std::vector<LogRecord>& records) {
        ASSERT_EQ(records.size() % 2, 0U);
        for (std::size_t index = 0; index < records.size(); index += 2) {
            const LogRecord& log = records[index];
            const LogRecord& trace = records[index + 1];
            ASSERT_EQ(log.channel + "," + trace.channel, "log,trace");
            EXPECT_EQ(std::tie(log.level, log.logger, log.function, log.file, log.line, log.text),
                      std::tie(trace.level, trace.logger, trace.function, trace.file, trace.line, trace.text));
        }
    });
}

TEST_F(TranscriptPropertyTest, EachMessageHasAKnownFormat) {
    forEachRecord(
        [](const LogRecord& record, const Line& line) { EXPECT_NE(line.kind, Line::unknown) << record.text; });
}

TEST_F(TranscriptPropertyTest, EachMessageContainsTheFunctionFileAndLineOfItsRecord) {
    forEachRecord([](const LogRecord& record, const Line& line) {
        if (record.file == markerFile) {
            return;
        }
        EXPECT_EQ(line.file, record.file) << record.text;
        EXPECT_EQ(line.line, record.line) << record.text;
        EXPECT_GT(record.line, 0);
        if (line.kind != Line::variable && line.kind != Line::message) {
            EXPECT_EQ(line.name, record.function) << record.text;
        }
    });
}

TEST_F(TranscriptPropertyTest, FunctionNamesContainNoClassNameParametersOrTemplateArguments) {
    const std::regex plain("~?[A-Za-z_]+|operator(bool| bool|\\+\\+|<<|>>|=)");
    forEachRecord([&](const LogRecord& record, const Line&) {
        EXPECT_TRUE(std::regex_match(record.function, plain)) << record.function << " in " << record.file;
    });
}

TEST_F(TranscriptPropertyTest, EachRequestIsEnclosedBySeparators) {
    forEachTranscript([](const Scenario& scenario, const std::vector<LogRecord>& records) {
        std::string open;  // entry point of the current request
        const auto log = channel(records, "log");
        for (std::size_t index = 0; index < log.size(); ++index) {
            const Line line = lineOf(log[index].text);
            const bool isMarker = log[index].file == markerFile;
            EXPECT_EQ(line.kind == Line::requestRule, isMarker && (log[index].line == 336 || log[index].line == 349));
            if (isMarker && log[index].line == 336) {
                EXPECT_EQ(open, "") << "a nested request";
                ASSERT_GT(log.size(), index + 2);
                const Line entry = lineOf(log[index + 1].text);
                EXPECT_EQ(log[index + 1].line, 337);
                EXPECT_EQ(entry.kind, Line::entering);
                EXPECT_EQ(entry.file, entryUnit);
                open = entry.name;
                const Line classId = lineOf(log[index + 2].text);
                EXPECT_EQ(classId.kind, Line::variable);
                EXPECT_EQ(classId.name, "classId");
            } else if (isMarker && log[index].line == 348) {
                EXPECT_EQ(line.kind, Line::exiting);
                EXPECT_EQ(line.name, open);
                ASSERT_GT(log.size(), index + 1);
                EXPECT_EQ(log[index + 1].line, 349);
                EXPECT_EQ(log[index + 1].text, rule);
            } else if (isMarker && log[index].line == 349) {
                open.clear();
            } else {
                EXPECT_EQ(open.empty(), !scenario.isRequest) << log[index].text;
            }
        }
        EXPECT_EQ(open, "") << "a request without an end";
    });
}

/** Returns the number of lines of the entry points' source file. */
int linesOfEntryUnit() {
    const std::string source = testsupport::readFile(ENTRY_UNIT_SOURCE);
    return static_cast<int>(std::count(source.begin(), source.end(), '\n'));
}

TEST_F(TranscriptPropertyTest, MarkersContainTheLineOfTheEntryPoint) {
    std::map<std::string, std::set<int>> linesOfEntryPoints;
    forEachTranscript([&](const Scenario&, const std::vector<LogRecord>& records) {
        int entryPointLine = 0;
        for (const LogRecord& record : channel(records, "log")) {
            const Line line = lineOf(record.text);
            if (record.file == markerFile && line.kind == Line::entering) {
                entryPointLine = line.line;
                linesOfEntryPoints[line.name].insert(line.line);
            } else if (record.file == markerFile && line.kind == Line::exiting) {
                EXPECT_EQ(line.line, entryPointLine);
            } else if (record.file == entryUnit && line.kind == Line::variable) {
                EXPECT_GE(record.line, entryPointLine) << "the entry point logs the class id";
            }
        }
    });
    std::set<int> all;
    for (const auto& [entryPoint, lines] : linesOfEntryPoints) {
        EXPECT_EQ(lines.size(), 1U) << entryPoint;
        all.insert(lines.begin(), lines.end());
    }
    EXPECT_EQ(all.size(), 8U) << "one per dispatched operation";
    EXPECT_GT(*all.begin(), 0);
    EXPECT_LE(*all.rbegin(), linesOfEntryUnit());
}

TEST_F(TranscriptPropertyTest, CaughtExceptionsAreLoggedByTheEntryPoint) {
    int caught = 0;
    forEachTranscript([&](const Scenario&, const std::vector<LogRecord>& records) {
        std::string entryPoint;
        for (const LogRecord& record : channel(records, "log")) {
            const Line line = lineOf(record.text);
            if (record.file == markerFile && line.kind == Line::entering) {
                entryPoint = line.name;
            } else if (record.file == entryUnit && line.kind == Line::message) {
                ++caught;
                EXPECT_EQ(record.function, entryPoint);
                EXPECT_GT(line.line, 0);
                EXPECT_LE(line.line, linesOfEntryUnit());
            }
        }
    });
    EXPECT_GT(caught, 0);
}

TEST_F(TranscriptPropertyTest, MarkersHaveTheFileAndLinesOfTheTraceHeader) {
    const std::map<int, std::string> functions{
        {336, "markProviderEntry"}, {337, "markProviderEntry"}, {348, "markProviderExit"}, {349, "markProviderExit"}};
    forEachRecord([&](const LogRecord& record, const Line&) {
        const bool isMarker = record.function.rfind("markProvider", 0) == 0;
        EXPECT_EQ(record.file == markerFile, isMarker);
        if (isMarker) {
            ASSERT_EQ(functions.count(record.line), 1U);
            EXPECT_EQ(functions.at(record.line), record.function);
            EXPECT_EQ(record.level, 4000);
        }
    });
}

/** Functions that were entered and not yet left, outermost first. */
class OpenFunctions {
public:
    void enter(const LogRecord& record, const Line& line) {
        open.push_back({line.file, line.name, record.line, false});
    }

    /** Handles a failure. Every open function can be left by the exception, without a log record. */
    void fail() {
        for (Function& each : open) {
            each.mayBeLeft = true;
        }
    }

    /** Closes the innermost function with this name. Functions inside it must have been left by an exception. */
    void exit(const Line& line) {
        while (!open.empty() && !(open.back().file == line.file && open.back().name == line.name)) {
            expectLeft(open.back());
            open.pop_back();
        }
        ASSERT_FALSE(open.empty()) << "left but not entered: " << line.name;
        open.pop_back();
    }

    void expectAllLeft() const { std::for_each(open.begin(), open.end(), expectLeft); }

private:
    struct Function {
        std::string file;
        std::string name;
        int line;
        bool mayBeLeft;
    };

    static void expectLeft(const Function& function) {
        EXPECT_TRUE(function.mayBeLeft || function.name == "getLeaseMoniker")
            << "entered but not left: " << function.name << " in " << function.file << ":" << function.line;
    }

    std::vector<Function> open;
};

TEST_F(TranscriptPropertyTest, EntriesAndExitsAreNested) {
    forEachTranscript([](const Scenario&, const std::vector<LogRecord>& records) {
        OpenFunctions functions;
        for (const LogRecord& record : channel(records, "log")) {
            const Line line = lineOf(record.text);
            if (line.kind == Line::entering) {
                functions.enter(record, line);
            } else if (line.kind == Line::exiting) {
                functions.exit(line);
            } else if (line.kind == Line::message && record.level == 3000) {
                functions.fail();
            }
        }
        functions.expectAllLeft();
    });
}

TEST_F(TranscriptPropertyTest, AnExitRepeatsTheParameterListOfItsEntry) {
    const std::set<std::string> changing{"getProperty", "deleteCMPIInstance", "operator>>"};
    forEachTranscript([&](const Scenario&, const std::vector<LogRecord>& records) {
        std::vector<Line> open;
        for (const LogRecord& record : channel(records, "log")) {
            const Line line = lineOf(record.text);
            if (line.kind == Line::entering) {
                open.push_back(line);
            } else if (line.kind == Line::exiting) {
                while (!open.empty() && open.back().name != line.name) {
                    open.pop_back();
                }
                ASSERT_FALSE(open.empty());
                if (changing.count(line.name) == 0) {
                    EXPECT_EQ(line.value, open.back().value) << line.name << " in " << line.file;
                }
                open.pop_back();
            }
        }
    });
}

}  // namespace
}  // namespace contract
