#include <gmock/gmock.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>
#include <sstream>

#include "agent/Probe.h"
#include "support/TemporaryDirectory.h"

using agent_test::ProbeResult;
using agent_test::runProbe;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::MatchesRegex;
using testing::SizeIs;

namespace {

class LogInProcess : public testing::Test {
protected:
    /** Runs the probe with a [log] table; its standard streams must stay empty. */
    void run(const std::string& settings, std::vector<std::string> arguments) {
        const std::string configuration = directory.write("agent.toml", "[log]\n" + settings);
        const ProbeResult result = runProbe(configuration, std::move(arguments));
        EXPECT_EQ(result.exitCode, 0);
        EXPECT_EQ(result.output, "");
        EXPECT_EQ(result.errors, "");
    }

    std::string toFile() const { return "destination = '" + directory.file("agent.log") + "'\n"; }

    std::vector<std::string> lines(const std::string& file = "agent.log") const {
        std::vector<std::string> all;
        std::istringstream stream(directory.read(file));
        for (std::string line; std::getline(stream, line);) {
            all.push_back(line);
        }
        return all;
    }

    testsupport::TemporaryDirectory directory;
};

const std::string timeFields = R"([0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9:]{8}\.[0-9]{6}[+-][0-9]{2}:[0-9]{2})";

TEST_F(LogInProcess, WritesARecordToEachChannel) {
    run(toFile(), {"log", "3000", "Ostrel.Test", "some text"});
    EXPECT_THAT(lines(),
                ElementsAre(MatchesRegex(timeFields + "\tlog\t3000\tOstrel.Test\tgetLessor\tLease.cpp\t42\tsome text"),
                            MatchesRegex(timeFields + "\ttrace\t3000\tOstrel.Test\t\t\t-1\tsome text")));
}

TEST_F(LogInProcess, PreventsForgedRecords) {
    run(toFile(), {"log", "3000", "Ostrel\tTest", "text\n2024-01-01T00:00:00.000000+00:00\tlog\t3000\\"});
    ASSERT_THAT(lines(), SizeIs(2));
    EXPECT_THAT(lines()[0], HasSubstr("\tOstrel\\tTest\t"));
    EXPECT_THAT(lines()[0], HasSubstr("\ttext\\n2024-01-01T00:00:00.000000+00:00\\tlog\\t3000\\\\"));
}

TEST_F(LogInProcess, WritesNoRecordAboveTheLevel) {
    run(toFile(), {"log", "4000", "Ostrel.Test", "some text"});
    EXPECT_THAT(lines(), SizeIs(0));
}

TEST_F(LogInProcess, HasLevelsForEachChannelAndLogger) {
    const std::string settings = toFile() + "trace_level = 0\n[[log.logger]]\nname = 'Ostrel.Test'\nlog_level = 6000\n";
    run(settings, {"log", "6000", "Ostrel.Test", "detail"});
    run(settings, {"log", "6000", "Ostrel.Other", "detail"});
    ASSERT_THAT(lines(), SizeIs(1));
    EXPECT_THAT(lines()[0], HasSubstr("\tlog\t6000\tOstrel.Test\t"));
}

TEST_F(LogInProcess, WritesNothingByDefault) {
    run("", {"log", "3000", "Ostrel.Test", "some text"});
    const ProbeResult unconfigured = runProbe(directory.file("none.toml"), {"log", "3000", "Ostrel.Test", "some text"});
    EXPECT_EQ(unconfigured.output + unconfigured.errors, "");
    EXPECT_EQ(unconfigured.exitCode, 0);
}

TEST_F(LogInProcess, ReportsWhetherALevelIsAdmitted) {
    const auto admits = [&](const std::string& settings, const std::string& level, const std::string& logger) {
        const std::string configuration = directory.write("agent.toml", "[log]\n" + settings);
        return runProbe(configuration, {"admits", level, logger}).output;
    };
    const std::string louder =
        toFile() + "trace_level = 4000\n[[log.logger]]\nname = 'Ostrel.Test'\nlog_level = 6000\n";
    EXPECT_EQ(admits(toFile(), "3000", "Ostrel.Test"), "yes\nyes\n");
    EXPECT_EQ(admits(toFile(), "3001", "Ostrel.Test"), "no\nno\n");
    EXPECT_EQ(admits(louder, "4000", "Ostrel.Other"), "yes\nyes\n") << "the trace channel admits it";
    EXPECT_EQ(admits(louder, "4001", "Ostrel.Other"), "no\nno\n");
    EXPECT_EQ(admits(louder, "6000", "Ostrel.Test"), "yes\nyes\n");
    EXPECT_EQ(admits(louder, "6001", "Ostrel.Test"), "no\nno\n");
    EXPECT_EQ(admits("log_level = 6000\n", "3000", "Ostrel.Test"), "no\nno\n") << "there is no destination";
}

TEST_F(LogInProcess, DropsRecordsForAFileThatCannotBeOpened) {
    run("destination = '" + directory.withSlash() + "'\n", {"log", "3000", "Ostrel.Test", "to a directory"});
    run("destination = '/proc/no/such/file'\n", {"log", "3000", "Ostrel.Test", "to nowhere"});
}

TEST_F(LogInProcess, DropsRecordsThatCannotBeWritten) {
    run(toFile(), {"limited"});
    EXPECT_LE(directory.read("agent.log").size(), 20U);
}

TEST_F(LogInProcess, WritesToNoDevice) {
    run("destination = '/dev/full'\n", {"log", "3000", "Ostrel.Test", "to a device"});
}

TEST_F(LogInProcess, DoesNotWaitForTheOtherEndOfAPipe) {
    ASSERT_EQ(::mkfifo(directory.file("pipe").c_str(), 0600), 0);
    run("destination = '" + directory.file("pipe") + "'\n", {"log", "3000", "Ostrel.Test", "into a pipe"});
}

TEST_F(LogInProcess, IsSilentWithoutSystemLogs) {
    run("destination = 'syslog'\n", {"log", "3000", "Ostrel.Test", "some text"});
    run("destination = 'journal'\n", {"log", "3000", "Ostrel.Test", "some text"});
}

TEST_F(LogInProcess, AppendsToAFileThatOthersCannotRead) {
    run(toFile(), {"log", "3000", "Ostrel.Test", "one"});
    run(toFile(), {"log", "3000", "Ostrel.Test", "two"});
    EXPECT_THAT(lines(), SizeIs(4));
    struct stat status {};
    ASSERT_EQ(::stat(directory.file("agent.log").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07137U, 0U);
}

TEST_F(LogInProcess, LosesNoRecordInACrash) {
    run(toFile(), {"crash"});
    ASSERT_THAT(lines(), SizeIs(2));
    EXPECT_THAT(lines()[0], HasSubstr("the last words"));
}

/** Cancellation unwinds the stack with an exception; the C library aborts the process if a catch swallows it. */
TEST_F(LogInProcess, CompletesTheRecordOfACancelledThread) {
    run(toFile(), {"cancelled"});
    ASSERT_THAT(lines(), SizeIs(2));
    EXPECT_THAT(lines()[1], HasSubstr("\ttrace\t3000\tOstrel.Test\t"));
}

TEST_F(LogInProcess, AcceptsRecordsFromManyThreads) {
    run(toFile(), {"many", "4", "200"});
    std::vector<std::string> all = lines();
    ASSERT_THAT(all, SizeIs(800));
    for (std::string& line : all) {
        line.erase(0, line.rfind('\t') + 1);
    }
    std::sort(all.begin(), all.end());
    EXPECT_EQ(std::unique(all.begin(), all.end()), all.end());
    EXPECT_THAT(all, testing::Each(MatchesRegex("thread [0-3] record [0-9]+")));
}

TEST_F(LogInProcess, RotatesTheFile) {
    run(toFile() + "rotation_size = 4096\nrotation_count = 2\n", {"many", "1", "200"});
    EXPECT_TRUE(std::filesystem::exists(directory.file("agent.1.log")));
    EXPECT_TRUE(std::filesystem::exists(directory.file("agent.2.log")));
    EXPECT_FALSE(std::filesystem::exists(directory.file("agent.3.log")));
    EXPECT_THAT(lines().back(), HasSubstr("record 199"));
    for (const char* name : {"agent.log", "agent.1.log", "agent.2.log"}) {
        struct stat status {};
        ASSERT_EQ(::stat(directory.file(name).c_str(), &status), 0);
        EXPECT_LE(status.st_size, 4096) << name;
        EXPECT_EQ(status.st_mode & 07137U, 0U) << name;
    }
}

TEST_F(LogInProcess, ReportsProblemsOfItsSettings) {
    run(toFile() + "log_level = 'high'\ncolour = 'red'\ntrace_level = 0\n", {"log", "4000", "Ostrel.Test", "text"});
    ASSERT_THAT(lines(), SizeIs(2));
    EXPECT_THAT(lines()[0], HasSubstr("\tlog\t3000\tOstrel.Agent\t"));
    EXPECT_THAT(lines()[0], HasSubstr("configuration key log.log_level must be an integer"));
    EXPECT_THAT(lines()[1], HasSubstr("configuration key log.colour is unknown"));
}

}  // namespace
