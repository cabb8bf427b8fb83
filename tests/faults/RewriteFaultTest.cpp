#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <set>

#include "Killing.h"
#include "TestEnvironment.h"

// State of a record file after a fault during a rewrite. docs/data-files.md documents these figures.

namespace faults {
namespace {

constexpr int leases = 10;
constexpr int writesOfRewrite = 1 + leases * linesOfLease;

class RewriteFaultTest : public testing::Test {
protected:
    RewriteFaultTest() { restart(); }

    void restart() {
        FileContents files = environment.filesAtFirst();
        files[leaseFile] = leaseRecords(leases);
        environment.restart(files);
    }

    /** Rewrites the file with a fault and returns its content. */
    std::string rewriteWith(const Fault& fault) {
        restart();
        const ObservedResponse response = environment.ask(requestNamed("ModifyLease"), &fault);
        EXPECT_EQ(response.outcome.rc, CMPI_RC_OK);
        return environment.files().at(leaseFile);
    }

    static Fault writeFailing(int number, bool lasting, int error = ENOSPC) {
        return {operationWrite, number, lasting, error};
    }

    std::string completeFile() {
        restart();
        environment.ask(requestNamed("ModifyLease"));
        return environment.files().at(leaseFile);
    }

    int allocationsOfRewrite() {
        restart();
        return environment.ask(requestNamed("ModifyLease")).counts.at(operationAllocate);
    }

    static std::string firstLines(const std::string& text, int count) {
        std::size_t end = 0;
        for (int line = 0; line < count; ++line) {
            end = text.find('\n', end) + 1;
        }
        return text.substr(0, end);
    }

    /** Returns the properties of each lease. */
    std::vector<Lines> leasesListed() {
        std::vector<Lines> listed;
        for (const std::string& line : environment.instancesOf("VELKO_Lease")) {
            if (line.rfind("InstanceID=", 0) == 0) {
                listed.emplace_back();
            }
            listed.back().push_back(line);
        }
        return listed;
    }

    TestEnvironment environment;
};

TEST_F(RewriteFaultTest, AFullDiskKeepsTheLinesWrittenBefore) {
    const std::string whole = completeFile();
    for (int number = 1; number <= writesOfRewrite; ++number) {
        ASSERT_EQ(rewriteWith(writeFailing(number, true)), firstLines(whole, number - 1));
    }
}

TEST_F(RewriteFaultTest, AFailedLineIsTheLastOneInTheFile) {
    const std::string whole = completeFile();
    for (int number = 1; number <= writesOfRewrite; ++number) {
        ASSERT_EQ(rewriteWith(writeFailing(number, false)), firstLines(whole, number))
            << "it is written when the file is closed, and no further line";
    }
}

TEST_F(RewriteFaultTest, PartialAndInterruptedWritesAreCompleted) {
    const std::string whole = completeFile();
    for (const int number : {1, 2, writesOfRewrite / 2, writesOfRewrite}) {
        EXPECT_EQ(rewriteWith(writeFailing(number, false, EINTR)), whole);
        EXPECT_EQ(rewriteWith(writeFailing(number, true, 0)), whole) << "each partially";
    }
}

/** The modification ends at the failed allocation and keeps the properties set so far, in file order. */
TEST_F(RewriteFaultTest, OneFailedAllocationKeepsTheFileOrWritesItWithTheValuesSetSoFar) {
    const std::string before = leaseRecords(leases);
    const std::string whole = completeFile();
    const int allocations = allocationsOfRewrite();
    std::vector<std::string> possible;
    for (int line = 0; line <= writesOfRewrite; ++line) {
        possible.push_back(firstLines(whole, line) + before.substr(firstLines(before, line).size()));
    }
    std::set<std::string> seen;
    for (int number = 1; number <= allocations; ++number) {
        SCOPED_TRACE(number);
        seen.insert(rewriteWith({operationAllocate, number, false}));
        ASSERT_THAT(seen, testing::Each(testing::AnyOfArray(possible)));
    }
    EXPECT_EQ(seen.count(before), 1U);
    EXPECT_GT(seen.size(), 2U) << "partial modifications";
}

TEST_F(RewriteFaultTest, LastingAllocationFailuresKeepTheFile) {
    const int allocations = allocationsOfRewrite();
    for (int number = 1; number <= allocations; ++number) {
        ASSERT_EQ(rewriteWith({operationAllocate, number, true}), leaseRecords(leases)) << number;
    }
}

TEST_F(RewriteFaultTest, AFailedOpenKeepsTheFile) {
    for (const int error : {EMFILE, EACCES}) {
        EXPECT_EQ(rewriteWith({operationOpen, 1, false, error}), leaseRecords(leases));
    }
}

TEST_F(RewriteFaultTest, AFailedCloseWritesTheCompleteFile) {
    const std::string whole = completeFile();
    for (const bool lasting : {false, true}) {
        EXPECT_EQ(rewriteWith({operationClose, 1, lasting, EIO}), whole);
    }
}

TEST_F(RewriteFaultTest, ARestartRepeatsTheFirstIncompleteRecordForTheRest) {
    completeFile();
    const std::vector<Lines> before = leasesListed();
    EXPECT_EQ(rewriteWith(writeFailing(1, true)), "");
    environment.unload();
    EXPECT_EQ(leasesListed().size(), 0U) << "an empty file contains no leases";
    for (int number = 2; number <= writesOfRewrite; ++number) {
        SCOPED_TRACE(number);
        rewriteWith(writeFailing(number, true));
        environment.unload();
        const std::vector<Lines> listed = leasesListed();
        const auto intact = static_cast<std::size_t>((number - 2) / linesOfLease);
        ASSERT_EQ(listed.size(), before.size());
        EXPECT_TRUE(std::equal(before.begin(), before.begin() + static_cast<std::ptrdiff_t>(intact), listed.begin()));
        for (std::size_t copy = intact + 1; copy < listed.size(); ++copy) {
            EXPECT_EQ(listed[copy], listed[intact]);
        }
    }
}

TEST_F(RewriteFaultTest, TheNextChangeInTheSameProcessWritesEverything) {
    const std::string whole = completeFile();
    for (const int number : {1, 2, 60, writesOfRewrite}) {
        rewriteWith(writeFailing(number, true));
        environment.ask(repairOf(leaseFile));
        EXPECT_EQ(environment.files().at(leaseFile), whole);
    }
}

TEST_F(RewriteFaultTest, CorrectingTheCountKeepsAllCompleteRecords) {
    const int intact = 4;
    const std::string rest = rewriteWith(writeFailing(2 + intact * linesOfLease + 5, true));
    environment.unload();
    FileContents files = environment.files();
    files[leaseFile] = std::to_string(intact) + rest.substr(rest.find('\n'));
    environment.restart(files);
    EXPECT_EQ(leasesListed().size(), static_cast<std::size_t>(intact));
    environment.ask(repairOf(leaseFile));
    EXPECT_EQ(environment.files().at(leaseFile),
              std::to_string(intact) + firstLines(rest, 1 + intact * linesOfLease).substr(2));
}

/** Rewrites of the record file of each class. */
class OperationsOfRewriteTest : public testing::TestWithParam<const char*> {};

TEST_P(OperationsOfRewriteTest, AreOneOpenOneWritePerLineAndOneClose) {
    TestEnvironment environment;
    const RequestCase& request = requestNamed(GetParam());
    FileContents files = environment.filesAtFirst();
    files[leaseFile] = leaseRecords(leases);
    files[warrantyFile] = warrantyRecords(leases);
    environment.restart(files);
    const Counts counts = environment.ask(request).counts;
    const std::string content = environment.files().at(request.changes);
    const int lines = static_cast<int>(std::count(content.begin(), content.end(), '\n'));
    EXPECT_EQ(lines, 1 + leases * (request.changes == std::string(leaseFile) ? linesOfLease : linesOfWarranty));
    EXPECT_EQ(onFiles(counts), (Counts{{operationOpen, 1}, {operationWrite, lines}, {operationClose, 1}}));
}

INSTANTIATE_TEST_SUITE_P(Classes, OperationsOfRewriteTest, testing::Values("ModifyLease", "ModifyWarranty"),
                         [](const auto& tested) { return std::string(tested.param); });

}  // namespace
}  // namespace faults
