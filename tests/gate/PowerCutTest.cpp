#include "GateFixture.h"
#include "SimulatedDisk.h"
#include "durable/RecordFile.h"

#include <unistd.h>

// Power failures during changes, before and after each operation on files.

extern const bool agentHasNoLog = true;

namespace gatetest {
namespace {

namespace fs = std::filesystem;
using testsupport::readFile;

class PowerCutTest : public GateTest {
protected:
    /** Returns the lease file after the recovery of a state of the directory. */
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
        const durable::RecordFile file = durable::recordFileIn(scratch.withSlash() + "data/", "Lease.dat");
        file.recover();
        std::string content = file.content().value_or("(none)");
        content.resize(
            std::min(content.find("saved copy "), content.size()));  // the last line of a copy does not matter
        return results[files] = content;
    }

    /** Makes a change, and simulates a power failure before and after each of its operations. */
    void change(const std::function<void()>& request) {
        gate().instanceMI();
        Disk disk;
        const std::string before = readFile(dataFile("Lease.dat"));
        std::vector<Event> events;
        {
            const Recording recording;
            request();
            events = recording.recorded;
        }
        const std::string after = readFile(dataFile("Lease.dat"));
        ASSERT_FALSE(events.empty());
        for (const Event& event : events) {
            disk.eachState([&](const Files& files) {
                const std::string& content = recovered(files);
                EXPECT_TRUE(content == before || content == after) << content << testing::PrintToString(files);
            });
            disk.apply(event);
            ASSERT_FALSE(HasFailure());
        }
        disk.eachState([&](const Files& files) { EXPECT_EQ(recovered(files), after) << "acknowledged"; });
    }

    const testsupport::TempDirectory scratch{access("/dev/shm", W_OK) == 0 ? "/dev/shm" : "/tmp"};
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
