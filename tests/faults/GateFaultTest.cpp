#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>

#include "ExpectedOutcome.h"
#include "Killing.h"

// Changes through the gate while file operations or allocations fail: success means that everything is stored, any
// other status means that nothing is changed.

namespace faults {
namespace {

using testing::AnyOf;
using testing::IsEmpty;
using testing::Not;

class GateFaultTest : public testing::TestWithParam<RequestCase> {
protected:
    GateFaultTest() : environment(TestEnvironment::Library::gate), expected(runWithoutFaults(environment, request())) {
        EXPECT_EQ(expected.response.outcome.rc, CMPI_RC_OK) << expected.response.outcome.message;
    }

    static const RequestCase& request() { return GetParam(); }
    static std::string file() { return request().changes; }

    static Lines sorted(Lines lines) {
        std::sort(lines.begin(), lines.end());
        return lines;
    }

    /** A restored file may have the last line of its saved copy. */
    static bool isComplete(const std::string& content) {
        const std::string records = content.substr(0, content.find("saved copy "));
        return file() == assetFile ||
               stateOf(records, file() == leaseFile ? linesOfLease : linesOfWarranty) == FileState::complete;
    }

    Lines now() { return sorted(environment.instancesOf(classOf(file()))); }

    void failOne(const Fault& fault) {
        environment.restart();
        now();  // loads the provider; GateLoadFaultTest tests faults during loading
        const ObservedResponse response = environment.ask(request(), &fault);
        EXPECT_FALSE(response.outcome.threw);
        EXPECT_EQ(response.leakedDescriptors, 0);
        if (response.outcome.rc == CMPI_RC_OK) {
            expectStored();
        } else {
            // If memory is short, the provider may respond as if the instance did not exist.
            EXPECT_THAT(response.outcome.rc,
                        AnyOf(CMPI_RC_ERR_FAILED, isOnFiles(fault.kind) ? CMPI_RC_ERR_FAILED : CMPI_RC_ERR_NOT_FOUND));
            EXPECT_THAT(response.outcome.message, Not(IsEmpty()));
            expectRolledBack(fault, response.outcome.message);
        }
    }

    void expectStored() {
        EXPECT_EQ(now(), sorted(expected.after));
        EXPECT_EQ(environment.files().at(file()), expected.fileAfter);
    }

    /**
     * Expects the instances from before the change. If the message says that the rollback failed, also accepts those
     * from after the change. Expects the same instances after a restart.
     */
    void expectRolledBack(const Fault& fault, const std::string& message) {
        const bool isAdmitted = message.find("could not be rolled back") != std::string::npos;
        EXPECT_TRUE(fault.lasting || !isAdmitted) << message;
        const Lines kept = now();
        if (isAdmitted) {
            EXPECT_THAT(kept, AnyOf(sorted(expected.before), sorted(expected.after))) << message;
        } else {
            EXPECT_EQ(kept, sorted(expected.before)) << message;
        }
        EXPECT_TRUE(isComplete(environment.files().at(file()))) << message;
        environment.unload();
        EXPECT_EQ(now(), kept) << "after a restart";
    }

    TestEnvironment environment;
    const ExpectedOutcome expected;
};

TEST_P(GateFaultTest, SuccessMeansStoredAndFailureMeansUnchanged) {
    eachFault(expected.response.counts, fileFailures(), [&](const Fault& fault) { failOne(fault); });
}

constexpr FaultSelection once{false};

/** Fails one allocation only, since the rollback allocates too. */
TEST_P(GateFaultTest, SuccessMeansStoredAndFailureMeansUnchangedIfOneAllocationFails) {
    eachFault(
        expected.response.counts, memoryFailures(), [&](const Fault& fault) { failOne(fault); }, once);
}

INSTANTIATE_TEST_SUITE_P(Requests, GateFaultTest, testing::ValuesIn(changingRequests()),
                         [](const auto& tested) { return tested.param.name; });

}  // namespace
}  // namespace faults
