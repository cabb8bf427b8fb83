#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>

#include "ExpectedOutcome.h"
#include "Killing.h"

// Changes through the gate while file operations fail: success means that everything is stored, any other status that
// nothing changed.

namespace faults {
namespace {

using testing::AnyOf;
using testing::Contains;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class GateFaultTest : public testing::TestWithParam<Request> {
protected:
    GateFaultTest() : environment(TestEnvironment::Library::gate), expected(runWithoutFaults(environment, request())) {
        EXPECT_EQ(expected.response.outcome.rc, CMPI_RC_OK) << expected.response.outcome.message;
    }

    static const Request& request() { return GetParam(); }
    static std::string file() { return request().changes; }

    static Lines sorted(Lines lines) {
        std::sort(lines.begin(), lines.end());
        return lines;
    }

    static bool isComplete(const std::string& content) {
        return file() == assetFile ||
               stateOf(content, file() == leaseFile ? linesOfLease : linesOfWarranty) == FileState::complete;
    }

    Lines now() { return sorted(environment.instancesOf(classOf(file()))); }

    void failOne(const Fault& fault) {
        environment.restart();
        const Response response = environment.ask(request(), &fault);
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
     * Returns the instances without the asset tag, which clients cannot set. It is lost if the provider could read only
     * a part of the file.
     */
    Lines withoutTag() const {
        Lines lines = expected.before;
        std::replace(lines.begin(), lines.end(), std::string("AssetIdTag=\"first value of AssetIdTag\""),
                     std::string("AssetIdTag=\"\""));
        return sorted(lines);
    }

    /**
     * Returns the possible instances after a failed change: the instances before it, unless the message reports that
     * the file may have changed.
     */
    std::vector<Lines> possible(const Fault& fault, const std::string& message) const {
        if (message.find("asset.dat may differ from what it was before") == std::string::npos) {
            return {sorted(expected.before)};
        }
        if (fault.lasting) {  // reading or writing may fail again
            return {sorted(expected.before), sorted(expected.after)};
        }
        EXPECT_TRUE(mayPreventReading(fault));
        return isOnFiles(fault.kind) ? std::vector<Lines>{withoutTag()}
                                     : std::vector<Lines>{sorted(expected.before), withoutTag()};
    }

    void expectRolledBack(const Fault& fault, const std::string& message) {
        const Lines kept = now();
        EXPECT_THAT(possible(fault, message), Contains(kept)) << message;
        if (!isComplete(environment.files().at(file()))) {
            EXPECT_TRUE(fault.lasting) << message;
            EXPECT_THAT(message, HasSubstr("stays damaged"));
        }
        if (fault.lasting && file() != assetFile) {
            // The rollback was not written either; a later change writes it.
            environment.ask(otherChangeOf(file()));
            environment.ask(repairOf(file()));
        }
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
