#include "GateFixture.h"

#include "support/Files.h"

#include <sys/resource.h>
#include <sys/stat.h>
#include <csignal>

// Changes that cannot be stored.

namespace gatetest {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testsupport::readFile;

using StorageTest = GateTest;

/** No file of this process can grow beyond a size while this lives, as if the disk were full. */
class FullDisk {
public:
    explicit FullDisk(rlim_t size) : handler(std::signal(SIGXFSZ, SIG_IGN)) {
        getrlimit(RLIMIT_FSIZE, &before);
        const rlimit limit{size, before.rlim_max};
        setrlimit(RLIMIT_FSIZE, &limit);
    }
    ~FullDisk() {
        setrlimit(RLIMIT_FSIZE, &before);
        std::signal(SIGXFSZ, handler);
    }
    FullDisk(const FullDisk&) = delete;
    FullDisk& operator=(const FullDisk&) = delete;

private:
    rlimit before{};
    void (*handler)(int);
};

/** What a change of a lease, each kind once, answers. */
std::vector<Outcome> changes(testsupport::ProviderLibrary& gate) {
    const auto with = [](const std::string& id) {
        return testsupport::instance(keyedPath(lease, id), {named("LeaseTerm", uint32(9))});
    };
    return {gate.createInstance(keyedPath(lease, "L2"), with("L2")),
            gate.modifyInstance(keyedPath(lease, "L1"), with("L1")), gate.deleteInstance(keyedPath(lease, "L1"))};
}

TEST_F(StorageTest, WithoutDataDirectoryNothingIsChanged) {
    create("L1", {named("LeaseTerm", uint32(1))});
    fs::remove_all(agentEnvironment::dataDirectory());
    for (const Outcome& outcome : changes(gate())) {
        EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_FAILED, dataFile("Lease.dat").string()));
        EXPECT_THAT(outcome.message, HasSubstr("No such file or directory"));
    }
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_EQ(valueIn(got("L1"), "LeaseTerm"), "1");
    fs::create_directory(agentEnvironment::dataDirectory());
    EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(2))}), isDone()) << "once there is one again";
    EXPECT_THAT(readFile(dataFile("Lease.dat")), HasSubstr("L1\n"));
}

TEST_F(StorageTest, AFileThatCannotBeOpenedIsNamedAndNothingIsChanged) {
    create("L1", {named("LeaseTerm", uint32(1))});
    fs::remove(dataFile("Lease.dat"));
    fs::create_directory(dataFile("Lease.dat"));
    for (const Outcome& outcome : changes(gate())) {
        EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_FAILED, "Lease.dat"));
    }
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_EQ(valueIn(got("L1"), "LeaseTerm"), "1");
}

TEST_F(StorageTest, WhatIsNoRegularFileIsNotWrittenTo) {
    create("L1");
    fs::remove(dataFile("Lease.dat"));
    ASSERT_EQ(mkfifo(dataFile("Lease.dat").c_str(), 0600), 0);
    EXPECT_THAT(create("L2"), isRefused(CMPI_RC_ERR_FAILED, "no regular file"));
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(StorageTest, WhenTheDiskIsFullANewRecordIsTakenBack) {
    create("L1", {named("LeaseTerm", uint32(1))});
    const std::string stored = readFile(dataFile("Lease.dat"));
    {
        const FullDisk disk(stored.size() + 10);
        EXPECT_THAT(create("L2"), isRefused(CMPI_RC_ERR_FAILED, "disk may be full"));
    }
    EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_THAT(create("L2"), isAnswered(1));
}

TEST_F(StorageTest, WhenTheDiskIsFullAModificationIsTakenBack) {
    create("L1", {named("Lessor", text("ACME"))});
    create("L2");
    const std::string stored = readFile(dataFile("Lease.dat"));
    {
        const FullDisk disk(stored.size() + 10);
        EXPECT_THAT(modify("L1", {named("Lessor", text(std::string(100, 'A')))}),
                    isRefused(CMPI_RC_ERR_FAILED, "disk may be full"));
    }
    EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
    EXPECT_EQ(valueIn(got("L1"), "Lessor"), "ACME");
}

TEST_F(StorageTest, ADeletionThatDoesNotReachTheFileIsTold) {
    create("L1");
    create("L2");
    {
        const FullDisk disk(10);
        EXPECT_THAT(remove("L1"), isRefused(CMPI_RC_ERR_FAILED, "Lease.dat"));
    }
    EXPECT_THAT(modify("L2", {named("LeaseTerm", uint32(1))}), isDone()) << "the next change brings all";
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("L2"));
}

TEST_F(StorageTest, AssetDataThatCannotBeStoredAreToldAndStayAsTheyWere) {
    const ObjectPath path = gate().enumerateInstanceNames(classPath(asset)).paths().front();
    const auto change = [&](const std::string& number) {
        return gate().modifyInstance(path, testsupport::instance(path, {named("AssetNumber", text(number))}));
    };
    EXPECT_THAT(change("A1"), isDone());
    {
        const FullDisk disk(100);
        EXPECT_THAT(change(std::string(200, 'A')), isRefused(CMPI_RC_ERR_FAILED, "AssetNumber"));
    }
    EXPECT_EQ(valueIn(only(asset), "AssetNumber"), "A1");
    fs::remove(dataFile("asset.dat"));
    fs::create_directory(dataFile("asset.dat"));
    EXPECT_THAT(change("A2"), isRefused(CMPI_RC_ERR_FAILED, "asset.dat"));
    fs::remove(dataFile("asset.dat"));
    EXPECT_THAT(change("A2"), isDone());
}

TEST_F(StorageTest, ADamagedFileIsMadeWholeByTheNextChange) {
    create("L1");
    testsupport::writeFile(dataFile("Lease.dat"), "7\nL1\n");
    EXPECT_THAT(create("L2"), isAnswered(1));
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2"));
}

}  // namespace
}  // namespace gatetest
