#include <unistd.h>

#include "GateFixture.h"
#include "SimulatedDisk.h"
#include "durable/RecordFile.h"
#include "support/FullDisk.h"
#include "support/TemporaryDirectory.h"

// Simulates power failures at each sync of a change. A failure between two syncs loses no more than a failure at the
// second sync.

extern const bool agentHasNoLog = true;

namespace gatetest {
namespace {

namespace fs = std::filesystem;
using testsupport::readFile;

class PowerCutTest : public GateTest {
protected:
    /** Returns the record file after the recovery of a state of the directory. */
    const std::string& recovered(const Files& files) {
        const auto known = results.find(files);
        if (known != results.end()) {
            return known->second;
        }
        fs::remove_all(scratch.path() / "data");
        fs::create_directory(scratch.path() / "data");
        for (const auto& [name, content] : files) {
            testsupport::writeFile(scratch.path() / "data" / name, content);
        }
        const durable::RecordFile file = durable::recordFileIn(scratch.withSlash() + "data/", recordFile);
        file.recover();
        std::string content = file.content().value_or("(none)");
        content.resize(
            std::min(content.find("saved copy "), content.size()));  // the last line of a saved copy is irrelevant
        return results[files] = content;
    }

    /** Makes a change through the gate, and simulates power failures. */
    void change(const std::function<void()>& request) {
        gate().instanceMI();
        write(Disk(), readFile(dataFile(recordFile)), request);
    }

    /**
     * Runs work that writes files, and simulates power failures before each sync, when most operations can be lost, and
     * at the end.
     * @param disk the state of the disk before the work, from which the records can be recovered
     */
    void write(Disk disk, const std::string& before, const std::function<void()>& work) {
        std::vector<Event> events;
        {
            const Recording recording;
            work();
            events = recording.recorded;
        }
        const std::string after = readFile(dataFile(recordFile));
        ASSERT_FALSE(events.empty());
        for (const Event& event : events) {
            if (event.kind == Kind::sync || event.kind == Kind::syncNames) {
                disk.eachState([&](const Files& files) {
                    const std::string& content = recovered(files);
                    EXPECT_TRUE(content == before || content == after) << content << testing::PrintToString(files);
                });
            }
            disk.apply(event);
            ASSERT_FALSE(HasFailure());
        }
        disk.eachState(
            [&](const Files& files) { EXPECT_EQ(recovered(files), after) << "the change was acknowledged"; });
    }

    const testsupport::TemporaryDirectory scratch{access("/dev/shm", W_OK) == 0 ? "/dev/shm" : "/tmp"};
    const char* recordFile = "Lease.dat";
    std::map<Files, std::string> results;
};

TEST_F(PowerCutTest, LeavesTheStateBeforeOrAfterEachChange) {
    const std::vector<NamedValue> values{named("Lessor", text("ACME Leasing")), named("LeaseTerm", uint32(36))};
    create("L1");
    const std::size_t none = results.size();
    change([&] { EXPECT_THAT(create("L2", values), isAnswered(1)); });
    change([&] { EXPECT_THAT(modify("L1", values), isDone()); });
    change([&] { EXPECT_THAT(create("L3"), isAnswered(1)); });
    change([&] { EXPECT_THAT(remove("L2"), isDone()); });
    EXPECT_GT(results.size(), none + 100) << "states were tried";
}

TEST_F(PowerCutTest, LeavesTheStateBeforeOrAfterEachChangeOfASmallFileWhicheverWritesAreLost) {
    recordFile = "Warranty.dat";
    const std::vector<NamedValue> values{named("Warrantor", text("ACME")), named("WarrantyDuration", uint32(36))};
    create("W1", {}, warranty);
    change([&] { EXPECT_THAT(create("W2", values, warranty), isAnswered(1)); });
    change([&] { EXPECT_THAT(modify("W1", values, warranty), isDone()); });
    change([&] { EXPECT_THAT(remove("W1", warranty), isDone()); });
    change([&] { EXPECT_THAT(create("W3", {}, warranty), isAnswered(1)); });
    EXPECT_GT(results.size(), 1000U) << "states were tried";
}

TEST_F(PowerCutTest, LeavesTheStateBeforeAChangeThatIsRolledBack) {
    create("L1", {named("Lessor", text("ACME Leasing"))});
    const std::string before = readFile(dataFile("Lease.dat"));
    change([&] {
        const testsupport::FullDisk disk(before.size() + 10);
        EXPECT_THAT(create("L2"), isRefused(CMPI_RC_ERR_FAILED, "disk may be full"));
    });
    EXPECT_EQ(readFile(dataFile("Lease.dat")), before);
}

TEST_F(PowerCutTest, LeavesARestorableFileDuringARecovery) {
    create("L1");
    create("L2", {named("Lessor", text("ACME Leasing"))});
    unload();
    const std::string complete = readFile(dataFile("Lease.dat"));
    testsupport::writeFile(dataFile("Lease.dat"), complete.substr(0, complete.size() / 2));
    write(Disk(), complete, [&] { gate().instanceMI(); });
    EXPECT_EQ(readFile(dataFile("Lease.dat")), complete);
}

TEST_F(PowerCutTest, LeavesTheOldOrTheImportedRecordsDuringAnImport) {
    create("L1");
    const std::string imported = readFile(dataFile("Lease.dat"));
    create("L2");
    unload();
    const durable::RecordFile leases =
        durable::recordFileIn(agentEnvironment::dataDirectory().string() + "/", "Lease.dat");
    write(Disk(), readFile(dataFile("Lease.dat")), [&] {
        leases.recover();
        leases.replace(imported);
    });
    EXPECT_EQ(readFile(dataFile("Lease.dat")), imported);
}

TEST_F(PowerCutTest, LosesNoRecordWhoseCopyAKilledProcessDidNotSync) {
    create("L1");
    create("L2");
    unload();
    Disk disk;
    disk.forget("Lease.dat.saved1");
    disk.forget("Lease.dat.saved2");
    write(disk, readFile(dataFile("Lease.dat")), [&] { EXPECT_THAT(remove("L1"), isDone()); });
}

TEST_F(PowerCutTest, LeavesTheStateBeforeARefusedChange) {
    create("L1");
    remove("L1");
    change([&] {
        EXPECT_THAT(create("L2", {named("Lessor", text("ACME")), named("ElementName", text("Other"))}),
                    isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "read-only"));
    });
    EXPECT_EQ(readFile(dataFile("Lease.dat")), "0\n");
}

}  // namespace
}  // namespace gatetest
