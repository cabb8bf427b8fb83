#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>

#include "Course.h"
#include "Killing.h"

// Changes through the gate while operations on files fail: an answer of success means that all is stored, and any other
// that nothing has changed.

namespace faults {
namespace {

using testing::AnyOf;
using testing::Contains;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class GateFaultTest : public testing::TestWithParam<Request> {
protected:
    GateFaultTest() : scene(Scene::Library::gate), course(undisturbed(scene, request())) {
        EXPECT_EQ(course.done.outcome.rc, CMPI_RC_OK) << course.done.outcome.message;
    }

    static const Request& request() { return GetParam(); }
    static std::string file() { return request().changes; }

    static Lines sorted(Lines lines) {
        std::sort(lines.begin(), lines.end());
        return lines;
    }

    static bool isWhole(const std::string& content) {
        return file() == assetFile ||
               stateOf(content, file() == leaseFile ? linesOfLease : linesOfWarranty) == FileState::whole;
    }

    Lines now() { return sorted(scene.instancesOf(classOf(file()))); }

    void failOne(const Fault& fault) {
        scene.restart();
        const Done done = scene.ask(request(), &fault);
        EXPECT_FALSE(done.outcome.threw);
        EXPECT_EQ(done.leftOpen, 0);
        if (done.outcome.rc == CMPI_RC_OK) {
            expectStored();
        } else {
            // For lack of memory, the provider may answer as if there were no such instance.
            EXPECT_THAT(done.outcome.rc,
                        AnyOf(CMPI_RC_ERR_FAILED, isOnFiles(fault.kind) ? CMPI_RC_ERR_FAILED : CMPI_RC_ERR_NOT_FOUND));
            EXPECT_THAT(done.outcome.message, Not(IsEmpty()));
            expectTakenBack(fault, done.outcome.message);
        }
    }

    void expectStored() {
        EXPECT_EQ(now(), sorted(course.after));
        EXPECT_EQ(scene.files().at(file()), course.fileAfter);
    }

    /** Without the tag, which nobody may write, and which is lost where the provider could not read it in the middle.
     */
    Lines withoutTag() const {
        Lines lines = course.before;
        std::replace(lines.begin(), lines.end(), std::string("AssetIdTag=\"first value of AssetIdTag\""),
                     std::string("AssetIdTag=\"\""));
        return sorted(lines);
    }

    /** What may be left of a change that failed: what was before, unless it is told that this may not be so. */
    std::vector<Lines> possible(const Fault& fault, const std::string& message) const {
        if (message.find("asset.dat may not be what it was before") == std::string::npos) {
            return {sorted(course.before)};
        }
        if (fault.lasting) {  // it cannot be written again, or not be read
            return {sorted(course.before), sorted(course.after)};
        }
        EXPECT_TRUE(mayHinderReading(fault));
        return isOnFiles(fault.kind) ? std::vector<Lines>{withoutTag()}
                                     : std::vector<Lines>{sorted(course.before), withoutTag()};
    }

    void expectTakenBack(const Fault& fault, const std::string& message) {
        const Lines kept = now();
        EXPECT_THAT(possible(fault, message), Contains(kept)) << message;
        if (!isWhole(scene.files().at(file()))) {
            EXPECT_TRUE(fault.lasting) << message;
            EXPECT_THAT(message, HasSubstr("stays damaged"));
        }
        if (fault.lasting && file() != assetFile) {
            scene.ask(detourOf(file()));  // what was taken back could not be written either: a later change does it
            scene.ask(repairOf(file()));
        }
        scene.unload();
        EXPECT_EQ(now(), kept) << "after a restart";
    }

    Scene scene;
    const Course course;
};

TEST_P(GateFaultTest, SuccessMeansStoredAndFailureMeansUnchanged) {
    eachFault(course.done.counts, fileFailures(), [&](const Fault& fault) { failOne(fault); });
}

constexpr Extent once{false};

/** Once: what is taken back takes memory too. */
TEST_P(GateFaultTest, SoTheyDoWhenMemoryIsRefusedOnce) {
    eachFault(
        course.done.counts, memoryFailures(), [&](const Fault& fault) { failOne(fault); }, once);
}

INSTANTIATE_TEST_SUITE_P(Requests, GateFaultTest, testing::ValuesIn(changingRequests()),
                         [](const auto& tested) { return tested.param.name; });

}  // namespace
}  // namespace faults
