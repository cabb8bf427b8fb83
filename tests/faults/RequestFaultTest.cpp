#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <regex>

#include "Scene.h"

// Each operation of the system and each allocation of each request fails in turn, alone and with all after it.

namespace faults {
namespace {

using testing::AnyOf;
using testing::ElementsAre;
using testing::StartsWith;

/** What a request brings about when nothing fails. */
struct Course {
    Counts counts;
    Lines before;  ///< instances of the class that it changes
    Lines after;
    std::string fileAfter;
};

class RequestFaultTest : public testing::TestWithParam<Request> {
protected:
    static const Request& request() { return GetParam(); }
    static bool changes() { return request().changes != nullptr; }
    static std::string file() { return changes() ? request().changes : leaseFile; }

    Course undisturbed() {
        scene.restart();
        Course course;
        course.before = scene.instancesOf(classOf(file()));
        const Done done = scene.ask(request());
        EXPECT_EQ(done.outcome.rc, CMPI_RC_OK) << done.outcome.message;
        course.counts = done.counts;
        course.after = scene.instancesOf(classOf(file()));
        course.fileAfter = scene.files().at(file());
        return course;
    }

    /** Lets one operation after the other of a kind fail. */
    void failEach(OperationKind kind, int error, const Course& course) {
        for (const bool lasting : {false, true}) {
            if (lasting && error == EINTR) {
                return;  // a call that is interrupted again and again may be made again and again
            }
            const int step = kind == operationAllocate ? ALLOCATION_STEP : 1;
            for (int number = 1; number <= course.counts.at(kind) && !HasFailure(); number += step) {
                const Fault fault{kind, number, lasting, error, {}};
                SCOPED_TRACE(testing::PrintToString(fault));
                failOne(fault, course);
            }
        }
    }

    Scene scene;

private:
    void failOne(const Fault& fault, const Course& course) {
        scene.restart();
        const Done done = scene.ask(request(), &fault);
        EXPECT_FALSE(done.outcome.threw) << "an exception left the provider";
        EXPECT_EQ(done.outcome.rc, CMPI_RC_OK);
        EXPECT_FALSE(done.outcome.hasMessage);
        const FileContents files = scene.files();
        EXPECT_THAT(filesNamed(files), ElementsAre(leaseFile, warrantyFile, assetFile)) << "a temporary file stays";
        expectOldOrNew(scene.instancesOf(classOf(file())), course);
        for (const auto& [name, content] : scene.filesAtFirst()) {
            if (!changes() || name != file()) {
                EXPECT_EQ(files.at(name), content);
            }
        }
        if (changes()) {
            expectRepairable(files.at(file()), fault, course);
        }
    }

    /**
     * Each value is that of before or that of after: what a modification has set when it is left stays. What could
     * not be read of asset data counts as empty in a modification.
     */
    static void expectOldOrNew(const Lines& now, const Course& course) {
        if (course.before.size() != course.after.size()) {
            EXPECT_THAT(now, AnyOf(course.before, course.after));
            return;
        }
        ASSERT_EQ(now.size(), course.before.size());
        for (std::size_t line = 0; line < now.size(); ++line) {
            EXPECT_THAT(now[line], AnyOf(course.before[line], course.after[line], "AssetIdTag=\"\""));
        }
    }

    /** The next change stores everything. */
    void expectRepairable(const std::string& content, const Fault& fault, const Course& course) {
        EXPECT_EQ(scene.ask(repairOf(file())).outcome.rc, CMPI_RC_OK);
        const Lines kept = scene.instancesOf(classOf(file()));
        const std::string whole = scene.files().at(file());
        scene.unload();
        EXPECT_EQ(scene.instancesOf(classOf(file())), kept);
        const std::string before = scene.filesAtFirst().at(file());
        if (file() == assetFile) {
            EXPECT_THAT(withoutTag(content), AnyOf(withoutTag(before), withoutTag(course.fileAfter)));
        } else if (fault.kind == operationWrite) {
            EXPECT_THAT(whole, StartsWith(content)) << "the beginning of what is in memory";
        } else {
            EXPECT_THAT(content, AnyOf(before, whole)) << "as before or as in memory";
        }
    }

    static std::vector<std::string> filesNamed(const FileContents& files) {
        std::vector<std::string> names;
        for (const auto& each : files) {
            names.push_back(each.first);
        }
        return names;
    }

    static std::string withoutTag(const std::string& content) {
        return std::regex_replace(content, std::regex("USER.AssetIdTag=.*"), "");
    }
};

TEST_P(RequestFaultTest, IsServedWithoutMemoryAndLeavesAllAsItWasOrAsItShouldBe) {
    failEach(operationAllocate, 0, undisturbed());
}

TEST_P(RequestFaultTest, IsServedWithoutFilesAndLeavesAllAsItWasOrAsItShouldBe) {
    const Course course = undisturbed();
    for (const FileFailure& failure : fileFailures()) {
        failEach(failure.kind, failure.error, course);
    }
}

INSTANTIATE_TEST_SUITE_P(Requests, RequestFaultTest, testing::ValuesIn(allRequests()),
                         [](const auto& tested) { return tested.param.name; });

}  // namespace
}  // namespace faults
