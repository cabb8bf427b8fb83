#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "Scene.h"
#include "support/FullDisk.h"

// A log that cannot be written costs its records, never a request.

namespace faults {
namespace {

namespace fs = std::filesystem;
using testing::AnyOf;

class LogFaultTest : public testing::Test {
protected:
    LogFaultTest() : log(scene.directory() / "agent.log") { configure(log); }

    void configure(const fs::path& destination) {
        scene.configure("destination = \"" + destination.string() + "\"\nlog_level = 9999\ntrace_level = 9999\n" +
                        "rotation_size = 4096\nrotation_count = 2");
    }

    /** Every request that changes something does as it would without a log. */
    void expectChangesAsWithout() {
        for (const Request& request : changingRequests()) {
            SCOPED_TRACE(request.name);
            scene.unload();
            Scene without;
            without.ask(request);
            without.unload();
            scene.restart();
            setenv("OSTREL_CONFIG", scene.configuration().c_str(), 1);
            EXPECT_EQ(scene.ask(request).outcome.rc, CMPI_RC_OK);
            EXPECT_EQ(scene.files(), without.files());
        }
    }

    Scene scene;
    fs::path log;
};

TEST_F(LogFaultTest, AllThatFailsWithTheLogLeavesTheRequestServed) {
    const Request& request = requestNamed("DeleteWarranty");
    scene.restart();
    const Counts counts = scene.ask(request).counts;
    const std::string before = scene.filesAtFirst().at(warrantyFile);
    const std::string after = scene.files().at(warrantyFile);
    ASSERT_GT(counts.at(operationRename), 0) << "the log is rotated";
    const auto failOne = [&](const Fault& fault) {
        scene.restart();
        const int openBefore = openDescriptors();
        const Done done = scene.ask(request, &fault);
        EXPECT_EQ(done.outcome.rc, CMPI_RC_OK);
        EXPECT_FALSE(done.outcome.threw);
        scene.ask(repairOf(warrantyFile));
        EXPECT_THAT(scene.files().at(warrantyFile), AnyOf(before, after));
        scene.unload();
        EXPECT_EQ(openDescriptors(), openBefore);
    };
    eachFault(counts, allFailures(), failOne, {true, 60});
}

TEST_F(LogFaultTest, ALogInADirectoryThatIsNotThereIsDoneWithout) {
    configure(scene.directory() / "missing" / "agent.log");
    expectChangesAsWithout();
}

TEST_F(LogFaultTest, ALogThatIsADirectoryIsDoneWithout) {
    fs::create_directory(log);
    expectChangesAsWithout();
}

TEST_F(LogFaultTest, ALogThatCannotGrowIsDoneWithout) {
    constexpr rlim_t full = 1U << 20U;
    scene.configure("destination = \"" + log.string() + "\"\nlog_level = 9999\ntrace_level = 9999\n");
    testsupport::writeFile(log, "");
    fs::resize_file(log, full);
    {
        const testsupport::FullDisk disk(full);
        expectChangesAsWithout();
    }
    EXPECT_EQ(fs::file_size(log), full);
}

TEST_F(LogFaultTest, ALogThatGoesBetweenTwoRequestsIsDoneWithout) {
    scene.restart();
    scene.ask(requestNamed("Leases"));
    fs::remove(log);
    fs::create_directory(log);
    EXPECT_EQ(scene.ask(requestNamed("DeleteLease")).outcome.rc, CMPI_RC_OK);
    EXPECT_EQ(scene.files().at(leaseFile).substr(0, 2), "1\n");
}

}  // namespace
}  // namespace faults
