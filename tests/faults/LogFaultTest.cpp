#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "Scene.h"
#include "support/FullDisk.h"
#include "support/Umask.h"

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
                        "rotation_size = 12288\nrotation_count = 2");
    }

    void removeLogs() const {
        for (const char* name : {"agent.log", "agent.1.log", "agent.2.log"}) {
            fs::remove(scene.directory() / name);
        }
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

    /** The log's files, rotated ones too, are for nobody but their owner and group; nothing else was made for them. */
    void expectOwnFilesOnly() const {
        for (const auto& entry : fs::directory_iterator(scene.directory())) {
            const std::string name = entry.path().filename();
            if (name.rfind("agent.", 0) == 0 && entry.path() != scene.configuration()) {
                EXPECT_EQ(entry.status().permissions() & ~ownersAndGroups, fs::perms::none) << name;
            }
        }
    }

    static constexpr fs::perms ownersAndGroups = fs::perms::owner_read | fs::perms::owner_write | fs::perms::group_read;
    const testsupport::Umask none{0};  // the log itself has to see to its mode
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
        expectOwnFilesOnly();
        removeLogs();
    };
    eachFault(counts, allFailures(), failOne);
}

TEST_F(LogFaultTest, ALogWhoseDirectoryGoesAtARotationIsDoneWithoutAndNobodyMakesTheDirectory) {
    const fs::path directory = scene.directory() / "log";
    const fs::path away = scene.directory() / "away";
    fs::create_directory(directory);
    configure(directory / "agent.log");
    const Request& request = requestNamed("DeleteWarranty");
    const Counts counts = scene.ask(request).counts;
    ASSERT_GT(counts.at(operationRename), 0) << "the log is rotated";
    for (int number = 1; number <= counts.at(operationRename); ++number) {
        SCOPED_TRACE(number);
        scene.restart();
        const Fault vanishing{operationRename, number, false, 0, [&] { fs::rename(directory, away); }};
        EXPECT_EQ(scene.ask(request, &vanishing).outcome.rc, CMPI_RC_OK);
        EXPECT_FALSE(fs::exists(directory));
        scene.unload();
        fs::remove_all(directory);
        fs::remove_all(away);
        fs::create_directory(directory);
    }
}

/** Opening it would wait for its reader. */
TEST_F(LogFaultTest, APipeInTheLogsPlaceIsNotOpenedAtARotation) {
    const Request& request = requestNamed("DeleteWarranty");
    const Fault planting{operationOpen, 1, false, 0, [&] {
                             EXPECT_FALSE(fs::exists(log)) << "the full one has been renamed";
                             EXPECT_EQ(mkfifo(log.c_str(), 0600), 0);
                         }};
    EXPECT_EQ(scene.ask(request, &planting).outcome.rc, CMPI_RC_OK);
    EXPECT_TRUE(fs::is_fifo(log));
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
