#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "ExpectedOutcome.h"

// Each system call and each allocation of each request fails, alone and with all later ones.

namespace faults {
namespace {

using testing::AnyOf;
using testing::ElementsAre;
using testing::StartsWith;

/**
 * Known deviations from "changed completely or not at all" (docs/data-files.md). Any other deviation fails the test.
 */
enum class Deviation {
    none,
    partialModification,  ///< the provider sets properties one by one and does not roll back
    assetNotRead,         ///< the provider continues after a failure to read asset.dat and writes all keys
};

Deviation deviationFor(const RequestCase& request, const Fault& fault) {
    if (request.instance.properties.empty()) {
        return Deviation::none;
    }
    if (request.changes == std::string(assetFile)) {
        return preventsReading(fault) ? Deviation::assetNotRead : Deviation::none;
    }
    return isOnFiles(fault.kind) ? Deviation::none : Deviation::partialModification;
}

class RequestFaultTest : public testing::TestWithParam<RequestCase> {
protected:
    RequestFaultTest() : expected(runWithoutFaults(environment, request())) {}

    static const RequestCase& request() { return GetParam(); }
    static bool changes() { return request().changes != nullptr; }
    const std::string& file() const { return expected.file; }

    void failOne(const Fault& fault) {
        environment.restart();
        const ObservedResponse response = environment.ask(request(), &fault);
        EXPECT_FALSE(response.outcome.threw) << "an exception left the provider";
        EXPECT_EQ(response.outcome.rc, expected.response.outcome.rc);
        EXPECT_FALSE(response.outcome.hasMessage);
        EXPECT_EQ(response.leakedDescriptors, 0);
        expectPartOfAnswer(expected, response.outcome, !isOnFiles(fault.kind));
        const FileContents files = environment.files();
        EXPECT_THAT(namesOf(files), ElementsAre(leaseFile, warrantyFile, assetFile)) << "a temporary file remains";
        for (const auto& [name, content] : environment.filesAtFirst()) {
            if (!changes() || name != file()) {
                EXPECT_EQ(files.at(name), content);
            }
        }
        expectOnlyKnownDeviation(deviationFor(request(), fault), fault, files.at(file()));
        if (changes()) {
            expectRepairable(files.at(file()), fault);
        }
    }

    TestEnvironment environment;
    const ExpectedOutcome expected;

private:
    void expectOnlyKnownDeviation(Deviation deviation, const Fault& fault, const std::string& content) {
        if (deviation == Deviation::assetNotRead) {
            expectAssetFile(expected, fault, content);
            return;
        }
        if (file() == assetFile) {
            EXPECT_THAT(content, AnyOf(expected.fileBefore, expected.fileAfter));
        }
        const Lines now = environment.instancesOf(classOf(file()));
        if (deviation == Deviation::partialModification) {
            expectSetInOrder(expected, request(), now);
        } else {
            EXPECT_THAT(now, AnyOf(expected.before, expected.after));
        }
    }

    /** Expects that the next change stores everything. */
    void expectRepairable(const std::string& content, const Fault& fault) {
        EXPECT_EQ(environment.ask(repairOf(file())).outcome.rc, CMPI_RC_OK);
        const Lines kept = environment.instancesOf(classOf(file()));
        const std::string whole = environment.files().at(file());
        environment.unload();
        EXPECT_EQ(environment.instancesOf(classOf(file())), kept);
        if (file() == assetFile) {
            EXPECT_NE(whole.find("USER.Location=repaired\n"), std::string::npos);
        } else if (fault.kind == operationWrite) {
            EXPECT_THAT(whole, StartsWith(content)) << "the beginning of the records in memory";
        } else {
            EXPECT_THAT(content, AnyOf(expected.fileBefore, whole)) << "as before or as in memory";
        }
    }

    static std::vector<std::string> namesOf(const FileContents& files) {
        std::vector<std::string> names;
        for (const auto& each : files) {
            names.push_back(each.first);
        }
        return names;
    }
};

TEST_P(RequestFaultTest, IsServedAndKeepsTheValuesSetSoFarIfAllocationsFail) {
    eachFault(expected.response.counts, memoryFailures(), [&](const Fault& fault) { failOne(fault); });
}

TEST_P(RequestFaultTest, IsServedAndChangesAllOrNothingIfFileOperationsFail) {
    eachFault(expected.response.counts, fileFailures(), [&](const Fault& fault) { failOne(fault); });
}

INSTANTIATE_TEST_SUITE_P(Requests, RequestFaultTest, testing::ValuesIn(allRequests()),
                         [](const auto& tested) { return tested.param.name; });

}  // namespace
}  // namespace faults
