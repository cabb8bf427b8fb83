#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/resource.h>

#include <cerrno>
#include <csignal>
#include <filesystem>

#include "Scene.h"

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
    std::vector<FileFailure> failures = fileFailures();
    failures.push_back({operationAllocate, 0});
    for (const FileFailure& failure : failures) {
        const int count = counts.at(failure.kind);
        const int step = 1 + count / 60;
        for (int number = 1; number <= count; number += step) {
            const Fault fault{failure.kind, number, false, failure.error, {}};
            SCOPED_TRACE(testing::PrintToString(fault));
            scene.restart();
            const Done done = scene.ask(request, &fault);
            EXPECT_EQ(done.outcome.rc, CMPI_RC_OK);
            EXPECT_FALSE(done.outcome.threw);
            scene.ask(repairOf(warrantyFile));
            EXPECT_THAT(scene.files().at(warrantyFile), AnyOf(before, after));
        }
    }
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
    auto* const handler = std::signal(SIGXFSZ, SIG_IGN);
    rlimit before{};
    getrlimit(RLIMIT_FSIZE, &before);
    const rlimit limit{full, before.rlim_max};
    setrlimit(RLIMIT_FSIZE, &limit);
    expectChangesAsWithout();
    setrlimit(RLIMIT_FSIZE, &before);
    std::signal(SIGXFSZ, handler);
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
