#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <tuple>

#include "Course.h"

// The data directory goes while a request works, and comes back later.

namespace faults {
namespace {

namespace fs = std::filesystem;
using testing::AnyOf;
using testing::IsEmpty;
using testing::Not;

class VanishingTest : public testing::TestWithParam<std::tuple<Scene::Library, Request>> {
protected:
    VanishingTest() : scene(std::get<0>(GetParam())), course(undisturbed(scene, request())) {}

    static const Request& request() { return std::get<1>(GetParam()); }
    static bool hasGate() { return std::get<0>(GetParam()) == Scene::Library::gate; }
    const std::string& file() const { return course.file; }
    fs::path data() const { return scene.dataDirectory(); }
    fs::path away() const { return scene.directory() / "away"; }

    static Lines sorted(Lines lines) {
        std::sort(lines.begin(), lines.end());
        return lines;
    }
    Lines now() { return sorted(scene.instancesOf(classOf(file()))); }

    /** The answer to the request in whose middle, or right before which, the directory goes. */
    testsupport::Outcome askWhileVanishing(const Fault* moment) {
        scene.restart();
        scene.library();
        const auto vanish = [this] { fs::rename(data(), away()); };
        if (moment == nullptr) {
            vanish();
        }
        const Fault vanishing = moment == nullptr ? Fault{} : Fault{moment->kind, moment->number, false, 0, vanish};
        const Done done = scene.ask(request(), moment == nullptr ? nullptr : &vanishing);
        EXPECT_FALSE(done.outcome.threw);
        EXPECT_EQ(done.leftOpen, 0);
        return done.outcome;
    }

    void vanishAt(const Fault* moment) {
        const testsupport::Outcome outcome = askWhileVanishing(moment);
        const bool isAnswered = outcome.rc == course.done.outcome.rc;
        if (isAnswered) {
            expectPartOfAnswer(course, outcome);
        } else {
            EXPECT_TRUE(hasGate()) << "the provider's answer is the same";
            EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
            EXPECT_THAT(outcome.message, Not(IsEmpty()));
        }
        if (file() != assetFile) {
            expectInMemory(isAnswered);
        }
        expectServedWhileItIsGone();
        fs::rename(away(), data());
        if (file() == assetFile) {
            EXPECT_THAT(scene.files().at(assetFile), AnyOf(course.fileBefore, course.fileAfter));
        }
        expectNextChangeStoresEverything();
    }

    void expectInMemory(bool isAnswered) {
        if (hasGate()) {
            EXPECT_EQ(now(), sorted(isAnswered ? course.after : course.before));
        } else {
            EXPECT_THAT(scene.instancesOf(classOf(file())), AnyOf(course.before, course.after));
        }
    }

    void expectServedWhileItIsGone() {
        const Done done = scene.ask(detourOf(file()));
        EXPECT_EQ(done.outcome.rc, hasGate() ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
        EXPECT_FALSE(fs::exists(data())) << "nobody makes it";
    }

    void expectNextChangeStoresEverything() {
        EXPECT_EQ(scene.ask(detourOf(file())).outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(scene.ask(repairOf(file())).outcome.rc, CMPI_RC_OK);
        const Lines kept = now();
        scene.unload();
        EXPECT_EQ(now(), kept);
    }

    Scene scene;
    const Course course;
};

TEST_P(VanishingTest, AnswersAsItShouldAndTheNextChangeStoresEverything) {
    vanishAt(nullptr);
    eachMoment(course.done.counts, [&](const Fault& moment) { vanishAt(&moment); });
}

std::string nameOfTest(const testing::TestParamInfo<VanishingTest::ParamType>& tested) {
    const bool hasGate = std::get<0>(tested.param) == Scene::Library::gate;
    return std::string(std::get<1>(tested.param).name) + (hasGate ? "ThroughTheGate" : "");
}

INSTANTIATE_TEST_SUITE_P(Requests, VanishingTest,
                         testing::Combine(testing::Values(Scene::Library::provider, Scene::Library::gate),
                                          testing::ValuesIn(allRequests())),
                         nameOfTest);

}  // namespace
}  // namespace faults
