#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <filesystem>
#include <set>
#include <utility>

#include "Course.h"

// The file of asset data belongs to the agent, which replaces it as a whole.

namespace faults {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::Pair;

class AssetFaultTest : public testing::Test {
protected:
    AssetFaultTest() : request(requestNamed("ModifyAssetNumber")), course(undisturbed(scene, request)) {}

    fs::path file() const { return scene.dataDirectory() / assetFile; }
    fs::path elsewhere() const { return scene.directory() / "elsewhere.dat"; }

    /** The file is a link to one elsewhere, which only its owner may read. */
    void restartWithLink() {
        scene.restart();
        fs::remove(elsewhere());
        fs::rename(file(), elsewhere());
        fs::permissions(elsewhere(), fs::perms::owner_read | fs::perms::owner_write);
        fs::create_symlink(elsewhere(), file());
    }

    /** What is left in the data directory beside the three files. */
    FileContents temporaryFiles() const {
        FileContents files = scene.files();
        for (const auto& each : scene.filesAtFirst()) {
            files.erase(each.first);
        }
        return files;
    }

    Scene scene;
    const Request& request;
    const Course course;
};

TEST_F(AssetFaultTest, EveryFailureKeepsTheLinkToTheFileAndItsMode) {
    restartWithLink();
    const Counts counts = scene.ask(request).counts;
    const auto failOne = [&](const Fault& fault) {
        restartWithLink();
        scene.ask(request, &fault);
        EXPECT_TRUE(fs::is_symlink(file()));
        EXPECT_EQ(fs::status(elsewhere()).permissions(), fs::perms::owner_read | fs::perms::owner_write);
        expectAssetFile(course, fault, scene.files().at(assetFile));
    };
    eachFault(counts, fileFailures(), failOne);
}

TEST_F(AssetFaultTest, AFullDiskKeepsTheFileAsItWas) {
    for (const Failure& failure :
         {Failure{operationWrite, ENOSPC}, Failure{operationSync, EIO}, Failure{operationRename, ENOSPC}}) {
        const Fault fault{failure.kind, 1, true, failure.error};
        scene.restart();
        scene.ask(request, &fault);
        EXPECT_EQ(scene.files(), scene.filesAtFirst()) << fault;
    }
}

TEST_F(AssetFaultTest, WhatCannotBeUndoneIsNoFailure) {
    const Fault fault{operationSync, 2, true, EIO};
    scene.restart();
    scene.ask(request, &fault);
    EXPECT_EQ(scene.files().at(assetFile), course.fileAfter) << "the directory could not be forced to the disk";
}

constexpr Extent everything{true, 100, true};

/** docs/data-files.md tells which. */
TEST_F(AssetFaultTest, OnlyAFileThatCouldNotBeReadLosesWhatWasNotGiven) {
    std::set<std::pair<OperationKind, int>> losing;
    const std::string lost = assetWithFields(course, 0);
    ASSERT_NE(lost, course.fileAfter);
    const auto failOne = [&](const Fault& fault) {
        scene.restart();
        scene.ask(request, &fault);
        if (scene.files().at(assetFile) == lost) {
            losing.emplace(fault.kind, fault.number);
        }
    };
    eachFault(course.done.counts, fileFailures(), failOne, everything);
    int operations = 0;
    for (const auto& each : onFiles(course.done.counts)) {
        operations += each.second;
    }
    EXPECT_EQ(operations, 25);
    EXPECT_THAT(losing, ElementsAre(Pair(operationOpen, 2), Pair(operationRead, 1), Pair(operationRead, 2),
                                    Pair(operationStatus, 2)))
        << "all that reading it takes, and nothing that writing it does";
}

/** What comes only after a failure fails too: taking back what was begun. */
TEST_F(AssetFaultTest, ASecondFailureLeavesATemporaryFileAtMost) {
    int left = 0;
    const auto failTwice = [&](const Fault& first) {
        for (const Failure& second : fileFailures()) {
            if (second.error == EINTR) {
                continue;  // again and again, it would be asked for again and again
            }
            Fault fault = first;
            fault.then = second;
            SCOPED_TRACE(testing::PrintToString(fault));
            scene.restart();
            const Done done = scene.ask(request, &fault);
            EXPECT_EQ(done.outcome.rc, CMPI_RC_OK);
            EXPECT_EQ(done.leftOpen, 0);
            const auto temporary = temporaryFiles().size();
            EXPECT_LE(temporary, second.kind == operationRemove ? 1U : 0U);
            left += static_cast<int>(temporary);
            expectAssetFile(course, fault, scene.files().at(assetFile));
        }
    };
    eachFault(course.done.counts, fileFailures(), failTwice, {false, 6});
    EXPECT_GT(left, 0);
}

/** Where a link is planted under the name of each file that is about to be made. */
fs::path* plantedTarget = nullptr;

void plant(const char* path) {
    std::error_code ignored;
    if (!fs::exists(fs::symlink_status(path, ignored))) {
        fs::create_symlink(*plantedTarget, path, ignored);
    }
}

TEST_F(AssetFaultTest, ALinkPlantedForTheTemporaryFileIsNotFollowed) {
    fs::path target = elsewhere();
    testsupport::writeFile(target, "somebody else's");
    scene.restart();
    scene.library();
    plantedTarget = &target;
    setCreationWitness(&plant);
    scene.ask(request);
    setCreationWitness(nullptr);
    EXPECT_EQ(testsupport::readFile(target), "somebody else's");
    EXPECT_EQ(scene.files().at(assetFile), course.fileAfter);
    EXPECT_FALSE(fs::is_symlink(file()));
    const FileContents planted = temporaryFiles();
    ASSERT_EQ(planted.size(), 1U) << "it was in the way";
    EXPECT_TRUE(fs::is_symlink(scene.dataDirectory() / planted.begin()->first));
}

}  // namespace
}  // namespace faults
