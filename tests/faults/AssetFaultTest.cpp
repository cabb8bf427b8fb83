#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <filesystem>

#include "Scene.h"

// The file of asset data belongs to the agent, which replaces it as a whole.

namespace faults {
namespace {

namespace fs = std::filesystem;
using testing::AnyOf;

class AssetFaultTest : public testing::Test {
protected:
    AssetFaultTest() : request(requestNamed("ModifyAsset")) {
        scene.ask(request);
        whole = scene.files().at(assetFile);
    }

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

    Scene scene;
    const Request& request;
    std::string whole;
};

TEST_F(AssetFaultTest, EveryFailureKeepsTheLinkToTheFileAndItsMode) {
    restartWithLink();
    Counts counts = scene.ask(request).counts;
    for (const FileFailure& failure : fileFailures()) {
        for (int number = 1; number <= counts[failure.kind]; ++number) {
            const Fault fault{failure.kind, number, false, failure.error, {}};
            SCOPED_TRACE(testing::PrintToString(fault));
            restartWithLink();
            scene.ask(request, &fault);
            EXPECT_TRUE(fs::is_symlink(file()));
            EXPECT_EQ(fs::status(elsewhere()).permissions(), fs::perms::owner_read | fs::perms::owner_write);
        }
    }
}

TEST_F(AssetFaultTest, AFullDiskKeepsTheFileAsItWas) {
    for (const FileFailure& failure :
         {FileFailure{operationWrite, ENOSPC}, FileFailure{operationSync, EIO}, FileFailure{operationRename, ENOSPC}}) {
        const Fault fault{failure.kind, 1, true, failure.error, {}};
        scene.restart();
        scene.ask(request, &fault);
        EXPECT_EQ(scene.files(), scene.filesAtFirst()) << fault;
    }
}

TEST_F(AssetFaultTest, WhatCannotBeUndoneIsNoFailure) {
    const Fault fault{operationSync, 2, true, EIO, {}};
    scene.restart();
    scene.ask(request, &fault);
    EXPECT_EQ(scene.files().at(assetFile), whole) << "the directory could not be forced to the disk";
}

}  // namespace
}  // namespace faults
