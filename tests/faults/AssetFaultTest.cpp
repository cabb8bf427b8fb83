#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <filesystem>
#include <set>
#include <utility>

#include "ExpectedOutcome.h"

// The agent owns the asset data file and replaces it atomically.

namespace faults {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::Pair;

class AssetFaultTest : public testing::Test {
protected:
    AssetFaultTest() : request(requestNamed("ModifyAssetNumber")), expected(runWithoutFaults(environment, request)) {}

    fs::path file() const { return environment.dataDirectory() / assetFile; }
    fs::path elsewhere() const { return environment.directory() / "elsewhere.dat"; }

    /** Replaces the file by a link to a file in another directory that only its owner can read. */
    void restartWithLink() {
        environment.restart();
        fs::remove(elsewhere());
        fs::rename(file(), elsewhere());
        fs::permissions(elsewhere(), fs::perms::owner_read | fs::perms::owner_write);
        fs::create_symlink(elsewhere(), file());
    }

    /** Returns the files in the data directory except the three data files. */
    FileContents temporaryFiles() const {
        FileContents files = environment.files();
        for (const auto& each : environment.filesAtFirst()) {
            files.erase(each.first);
        }
        return files;
    }

    TestEnvironment environment;
    const RequestCase& request;
    const ExpectedOutcome expected;
};

TEST_F(AssetFaultTest, EveryFailureKeepsTheSymbolicLinkAndTheMode) {
    restartWithLink();
    const Counts counts = environment.ask(request).counts;
    const auto failOne = [&](const Fault& fault) {
        restartWithLink();
        environment.ask(request, &fault);
        EXPECT_TRUE(fs::is_symlink(file()));
        EXPECT_EQ(fs::status(elsewhere()).permissions(), fs::perms::owner_read | fs::perms::owner_write);
        expectAssetFile(expected, fault, environment.files().at(assetFile));
    };
    eachFault(counts, fileFailures(), failOne);
}

TEST_F(AssetFaultTest, AFullDiskKeepsTheFileUnchanged) {
    for (const InjectedFailure& failure : {InjectedFailure{operationWrite, ENOSPC}, InjectedFailure{operationSync, EIO},
                                           InjectedFailure{operationRename, ENOSPC}}) {
        const Fault fault{failure.kind, 1, true, failure.error};
        environment.restart();
        environment.ask(request, &fault);
        EXPECT_EQ(environment.files(), environment.filesAtFirst()) << fault;
    }
}

TEST_F(AssetFaultTest, AFailureToSyncTheDirectoryIsIgnored) {
    const Fault fault{operationSync, 2, true, EIO};
    environment.restart();
    environment.ask(request, &fault);
    EXPECT_EQ(environment.files().at(assetFile), expected.fileAfter) << "the directory could not be synced";
}

constexpr FaultSelection everything{true, 100, true};

/** docs/data-files.md lists these operations. */
TEST_F(AssetFaultTest, OnlyAnUnreadableFileLosesUnsetValues) {
    std::set<std::pair<OperationKind, int>> losing;
    const std::string lost = assetWithFields(expected, 0);
    ASSERT_NE(lost, expected.fileAfter);
    const auto failOne = [&](const Fault& fault) {
        environment.restart();
        environment.ask(request, &fault);
        if (environment.files().at(assetFile) == lost) {
            losing.emplace(fault.kind, fault.number);
        }
    };
    eachFault(expected.response.counts, fileFailures(), failOne, everything);
    int operations = 0;
    for (const auto& each : onFiles(expected.response.counts)) {
        operations += each.second;
    }
    EXPECT_EQ(operations, 25);
    EXPECT_THAT(losing, ElementsAre(Pair(operationOpen, 2), Pair(operationRead, 1), Pair(operationRead, 2),
                                    Pair(operationStatus, 2)))
        << "all operations that read the file and none that write it";
}

/**
 * The second fault applies to all later operations of its kind, including those that run only after a failure, such as
 * the removal of the temporary file.
 */
TEST_F(AssetFaultTest, ASecondFailureLeavesAtMostATemporaryFile) {
    int left = 0;
    const auto failTwice = [&](const Fault& first) {
        for (const InjectedFailure& second : fileFailures()) {
            if (second.error == EINTR) {
                continue;  // would be retried forever
            }
            Fault fault = first;
            fault.then = second;
            SCOPED_TRACE(testing::PrintToString(fault));
            environment.restart();
            const ObservedResponse response = environment.ask(request, &fault);
            EXPECT_EQ(response.outcome.rc, CMPI_RC_OK);
            EXPECT_EQ(response.leakedDescriptors, 0);
            const auto temporary = temporaryFiles().size();
            EXPECT_LE(temporary, second.kind == operationRemove ? 1U : 0U);
            left += static_cast<int>(temporary);
            expectAssetFile(expected, fault, environment.files().at(assetFile));
        }
    };
    eachFault(expected.response.counts, fileFailures(), failTwice, {false, 6});
    EXPECT_GT(left, 0);
}

/** The target of the links that are created at the paths of new files. */
fs::path* plantedTarget = nullptr;

void plant(const char* path) {
    std::error_code ignored;
    if (!fs::exists(fs::symlink_status(path, ignored))) {
        fs::create_symlink(*plantedTarget, path, ignored);
    }
}

TEST_F(AssetFaultTest, ASymbolicLinkInPlaceOfTheTemporaryFileIsNotFollowed) {
    fs::path target = elsewhere();
    testsupport::writeFile(target, "another user's");
    environment.restart();
    environment.library();
    plantedTarget = &target;
    setCreationObserver(&plant);
    environment.ask(request);
    setCreationObserver(nullptr);
    EXPECT_EQ(testsupport::readFile(target), "another user's");
    EXPECT_EQ(environment.files().at(assetFile), expected.fileAfter);
    EXPECT_FALSE(fs::is_symlink(file()));
    const FileContents planted = temporaryFiles();
    ASSERT_EQ(planted.size(), 1U) << "the link was created";
    EXPECT_TRUE(fs::is_symlink(environment.dataDirectory() / planted.begin()->first));
}

}  // namespace
}  // namespace faults
