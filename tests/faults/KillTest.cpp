#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <csignal>
#include <stdexcept>

#include "Killing.h"

// Kills a process before each of its operations. The next process then loads the files.

namespace faults {
namespace {

using testing::AnyOf;

constexpr int records = 4;

class KillTest : public testing::TestWithParam<RequestCase> {
protected:
    static const RequestCase& request() { return GetParam(); }
    static std::string file() { return request().changes; }

    void restart() {
        FileContents files = environment.filesAtFirst();
        files[leaseFile] = leaseRecords(records);
        files[warrantyFile] = warrantyRecords(records);
        environment.restart(files);
        before = environment.files();
    }

    /** Kills a process that makes the request before one of its operations. */
    void killBefore(OperationKind kind, int number) {
        restart();
        const Fault fault{kind, number, false, 0, [] { std::raise(SIGKILL); }};
        EXPECT_TRUE(isKilled([&] { environment.ask(request(), &fault); }));
    }

    void expectCompleteOrTruncated(const FileContents& left) {
        const std::string& content = left.at(file());
        if (file() == assetFile) {
            EXPECT_THAT(content, AnyOf(before.at(file()), whole.at(file())));
            return;
        }
        EXPECT_THAT(content, AnyOf(before.at(file()), testing::ResultOf(
                                                          "the file when nothing fails, cut off after a line",
                                                          [&](const std::string& text) {
                                                              return (text.empty() || text.back() == '\n') &&
                                                                     whole.at(file()).rfind(text, 0) == 0;
                                                          },
                                                          true)));
    }

    TestEnvironment environment;
    FileContents before;
    FileContents whole;
};

TEST_P(KillTest, EveryKillLeavesCompleteAssetDataAndOnlyCompleteLinesOfRecords) {
    restart();
    const Counts counts = environment.ask(request()).counts;
    whole = environment.files();
    eachMoment(counts, [&](const Fault& moment) {
        killBefore(moment.kind, moment.number);
        const FileContents left = environment.files();
        for (const auto& [name, content] : before) {
            if (name != file()) {
                EXPECT_EQ(left.at(name), content);
            }
        }
        EXPECT_LE(left.size(), before.size() + (file() == assetFile ? 1 : 0)) << "one temporary file at most";
        expectCompleteOrTruncated(left);
        EXPECT_EQ(environment.ask(repairOf(file())).outcome.rc, CMPI_RC_OK) << "the next process serves";
        EXPECT_EQ(environment.ask(request()).outcome.rc, CMPI_RC_OK);
    });
}

INSTANTIATE_TEST_SUITE_P(Requests, KillTest, testing::ValuesIn(changingRequests()),
                         [](const auto& tested) { return tested.param.name; });

TEST(KillProcessTest, EndsWhenItsWorkReturns) {
    EXPECT_FALSE(isKilled([] {}));
    EXPECT_THROW(isKilled([] { throw std::runtime_error("on the way"); }), std::runtime_error);
}

TEST(KillStateTest, DistinguishesCompleteFiles) {
    EXPECT_EQ(stateOf(leaseRecords(3), linesOfLease), FileState::complete);
    EXPECT_EQ(stateOf(warrantyRecords(3), linesOfWarranty), FileState::complete);
    EXPECT_EQ(stateOf("0\n", linesOfLease), FileState::complete);
    EXPECT_EQ(stateOf("", linesOfLease), FileState::empty);
    const std::string cut = leaseRecords(3).substr(0, leaseRecords(2).size() + 20);
    EXPECT_EQ(stateOf(cut, linesOfLease), FileState::truncated);
    EXPECT_EQ(completeRecordsIn(cut, linesOfLease), 2);
    EXPECT_EQ(completeRecordsIn("", linesOfLease), 0);
}

}  // namespace
}  // namespace faults
