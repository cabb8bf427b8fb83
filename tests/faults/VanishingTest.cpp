#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <tuple>

#include "ExpectedOutcome.h"
#include "support/Values.h"

// The data directory is removed during a request and restored later.

namespace faults {
namespace {

namespace fs = std::filesystem;
using testing::AnyOf;
using testing::IsEmpty;
using testing::Not;

class VanishingTest : public testing::TestWithParam<std::tuple<TestEnvironment::Library, RequestCase>> {
protected:
    VanishingTest() : environment(std::get<0>(GetParam())), expected(runWithoutFaults(environment, request())) {}

    static const RequestCase& request() { return std::get<1>(GetParam()); }
    static bool hasGate() { return std::get<0>(GetParam()) == TestEnvironment::Library::gate; }
    const std::string& file() const { return expected.file; }
    fs::path data() const { return environment.dataDirectory(); }
    fs::path away() const { return environment.directory() / "away"; }

    static Lines sorted(Lines lines) {
        std::sort(lines.begin(), lines.end());
        return lines;
    }
    Lines now() { return sorted(environment.instancesOf(classOf(file()))); }

    /** Removes the directory during or, if moment is null, before the request. Returns the outcome. */
    testsupport::Outcome askWhileVanishing(const Fault* moment) {
        environment.restart();
        now();  // loads the provider, which reads its files
        const auto vanish = [this] { fs::rename(data(), away()); };
        if (moment == nullptr) {
            vanish();
        }
        const Fault vanishing = moment == nullptr ? Fault{} : Fault{moment->kind, moment->number, false, 0, vanish};
        const ObservedResponse response = environment.ask(request(), moment == nullptr ? nullptr : &vanishing);
        EXPECT_FALSE(response.outcome.threw);
        EXPECT_LE(response.leakedDescriptors, 0) << "only the directory's lock may be closed";
        return response.outcome;
    }

    /** Restores the directory without files. The next change must store each record, or be refused. */
    void returnEmptyAfter(const Fault& moment) {
        const bool isAnswered = askWhileVanishing(&moment).rc == CMPI_RC_OK;
        fs::remove_all(away());
        fs::create_directory(data());
        const testsupport::Outcome outcome = environment.ask(otherChangeOf(file())).outcome;
        if (outcome.rc != CMPI_RC_OK) {
            EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
            EXPECT_THAT(outcome.message, testing::HasSubstr("The record files were removed."));
            EXPECT_FALSE(isAnswered);
            return;
        }
        environment.ask(repairOf(file()));
        environment.unload();
        EXPECT_EQ(now(), sorted(isAnswered ? expected.after : expected.before));
    }

    void vanishAt(const Fault* moment) {
        const testsupport::Outcome outcome = askWhileVanishing(moment);
        const bool isAnswered = outcome.rc == expected.response.outcome.rc;
        if (isAnswered) {
            expectPartOfAnswer(expected, outcome);
        } else {
            EXPECT_TRUE(hasGate()) << "the provider returns the same status";
            EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
            EXPECT_THAT(outcome.message, Not(IsEmpty()));
        }
        if (file() != assetFile) {
            expectInMemory(isAnswered);
        }
        expectServedWithoutDirectory();
        fs::rename(away(), data());
        if (file() == assetFile) {
            EXPECT_THAT(environment.files().at(assetFile), AnyOf(expected.fileBefore, expected.fileAfter));
        }
        expectNextChangeStoresEverything();
    }

    void expectInMemory(bool isAnswered) {
        if (hasGate() && !isAnswered) {
            // The gate cannot roll back a change without the directory, and then returns no records.
            const testsupport::Outcome read =
                environment.library().enumerateInstances(testsupport::objectPath("root/cimv2", classOf(file())));
            EXPECT_TRUE(read.rc == CMPI_RC_ERR_FAILED || now() == sorted(expected.before)) << read.rc;
        } else if (hasGate()) {
            EXPECT_EQ(now(), sorted(expected.after));
        } else {
            EXPECT_THAT(environment.instancesOf(classOf(file())), AnyOf(expected.before, expected.after));
        }
    }

    void expectServedWithoutDirectory() {
        const ObservedResponse response = environment.ask(otherChangeOf(file()));
        EXPECT_EQ(response.outcome.rc, hasGate() ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
        EXPECT_FALSE(fs::exists(data())) << "it is not created";
    }

    void expectNextChangeStoresEverything() {
        EXPECT_EQ(environment.ask(otherChangeOf(file())).outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(environment.ask(repairOf(file())).outcome.rc, CMPI_RC_OK);
        const Lines kept = now();
        environment.unload();
        EXPECT_EQ(now(), kept);
    }

    TestEnvironment environment;
    const ExpectedOutcome expected;
};

TEST_P(VanishingTest, ReturnsTheExpectedOutcomeAndTheNextChangeStoresEverything) {
    vanishAt(nullptr);
    eachMoment(expected.response.counts, [&](const Fault& moment) { vanishAt(&moment); });
}

TEST_P(VanishingTest, NoRecordIsLostIfTheDirectoryReturnsEmpty) {
    if (hasGate() && request().changes != nullptr && file() != assetFile) {
        eachMoment(expected.response.counts, [&](const Fault& moment) { returnEmptyAfter(moment); });
    }
}

std::string nameOfTest(const testing::TestParamInfo<VanishingTest::ParamType>& tested) {
    const bool hasGate = std::get<0>(tested.param) == TestEnvironment::Library::gate;
    return std::string(std::get<1>(tested.param).name) + (hasGate ? "ThroughTheGate" : "");
}

INSTANTIATE_TEST_SUITE_P(Requests, VanishingTest,
                         testing::Combine(testing::Values(TestEnvironment::Library::provider,
                                                          TestEnvironment::Library::gate),
                                          testing::ValuesIn(allRequests())),
                         nameOfTest);

}  // namespace
}  // namespace faults
