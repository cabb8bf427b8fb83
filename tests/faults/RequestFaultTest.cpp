#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Course.h"

// Each operation of the system and each allocation of each request fails in turn, alone and with all after it.

namespace faults {
namespace {

using testing::AnyOf;
using testing::ElementsAre;
using testing::StartsWith;

/**
 * What a failure may leave that is neither as it was nor as it should be, with the reason (docs/data-files.md). Nothing
 * else is let pass.
 */
enum class Exception {
    none,
    modificationHalfWay,  ///< the provider sets the properties one after the other, and takes none back
    assetNotRead,         ///< the provider goes on where reading asset.dat failed, and writes all of its keys
};

Exception exceptionFor(const Request& request, const Fault& fault) {
    if (request.instance.properties.empty()) {
        return Exception::none;
    }
    if (request.changes == std::string(assetFile)) {
        return hindersReading(fault) ? Exception::assetNotRead : Exception::none;
    }
    return isOnFiles(fault.kind) ? Exception::none : Exception::modificationHalfWay;
}

class RequestFaultTest : public testing::TestWithParam<Request> {
protected:
    RequestFaultTest() : course(undisturbed(scene, request())) {}

    static const Request& request() { return GetParam(); }
    static bool changes() { return request().changes != nullptr; }
    const std::string& file() const { return course.file; }

    void failOne(const Fault& fault) {
        scene.restart();
        const Done done = scene.ask(request(), &fault);
        EXPECT_FALSE(done.outcome.threw) << "an exception left the provider";
        EXPECT_EQ(done.outcome.rc, course.done.outcome.rc);
        EXPECT_FALSE(done.outcome.hasMessage);
        EXPECT_EQ(done.leftOpen, 0);
        expectPartOfAnswer(course, done.outcome, !isOnFiles(fault.kind));
        const FileContents files = scene.files();
        EXPECT_THAT(namesOf(files), ElementsAre(leaseFile, warrantyFile, assetFile)) << "a temporary file stays";
        for (const auto& [name, content] : scene.filesAtFirst()) {
            if (!changes() || name != file()) {
                EXPECT_EQ(files.at(name), content);
            }
        }
        expectNoMoreThanTheException(exceptionFor(request(), fault), fault, files.at(file()));
        if (changes()) {
            expectRepairable(files.at(file()), fault);
        }
    }

    Scene scene;
    const Course course;

private:
    void expectNoMoreThanTheException(Exception exception, const Fault& fault, const std::string& content) {
        if (exception == Exception::assetNotRead) {
            expectAssetFile(course, fault, content);
            return;
        }
        if (file() == assetFile) {
            EXPECT_THAT(content, AnyOf(course.fileBefore, course.fileAfter));
        }
        const Lines now = scene.instancesOf(classOf(file()));
        if (exception == Exception::modificationHalfWay) {
            expectSetInOrder(course, request(), now);
        } else {
            EXPECT_THAT(now, AnyOf(course.before, course.after));
        }
    }

    /** The next change stores everything. */
    void expectRepairable(const std::string& content, const Fault& fault) {
        EXPECT_EQ(scene.ask(repairOf(file())).outcome.rc, CMPI_RC_OK);
        const Lines kept = scene.instancesOf(classOf(file()));
        const std::string whole = scene.files().at(file());
        scene.unload();
        EXPECT_EQ(scene.instancesOf(classOf(file())), kept);
        if (file() == assetFile) {
            EXPECT_NE(whole.find("USER.Location=repaired\n"), std::string::npos);
        } else if (fault.kind == operationWrite) {
            EXPECT_THAT(whole, StartsWith(content)) << "the beginning of what is in memory";
        } else {
            EXPECT_THAT(content, AnyOf(course.fileBefore, whole)) << "as before or as in memory";
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

TEST_P(RequestFaultTest, IsServedWithoutMemoryAndLeavesWhatItHadSetByThen) {
    eachFault(course.done.counts, memoryFailures(), [&](const Fault& fault) { failOne(fault); });
}

TEST_P(RequestFaultTest, IsServedWithoutFilesAndLeavesAllAsItWasOrAsItShouldBeUnlessItCouldNotReadAssetData) {
    eachFault(course.done.counts, fileFailures(), [&](const Fault& fault) { failOne(fault); });
}

INSTANTIATE_TEST_SUITE_P(Requests, RequestFaultTest, testing::ValuesIn(allRequests()),
                         [](const auto& tested) { return tested.param.name; });

}  // namespace
}  // namespace faults
