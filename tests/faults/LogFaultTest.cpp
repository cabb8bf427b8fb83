#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "TestEnvironment.h"
#include "support/FullDisk.h"
#include "support/Umask.h"

// A log that cannot be written loses records but never fails a request.

namespace faults {
namespace {

namespace fs = std::filesystem;
using testing::AnyOf;

class LogFaultTest : public testing::Test {
protected:
    LogFaultTest() : log(environment.directory() / "agent.log") { configure(log); }

    void configure(const fs::path& destination) {
        environment.configure("destination = \"" + destination.string() + "\"\nlog_level = 9999\ntrace_level = 9999\n" +
                              "rotation_size = 12288\nrotation_count = 2");
    }

    void removeLogs() const {
        for (const char* name : {"agent.log", "agent.1.log", "agent.2.log"}) {
            fs::remove(environment.directory() / name);
        }
    }

    /** Expects that every changing request has the same result as without a log. */
    void expectChangesAsWithoutLog() {
        for (const RequestCase& request : changingRequests()) {
            SCOPED_TRACE(request.name);
            environment.unload();
            TestEnvironment without;
            without.ask(request);
            without.unload();
            environment.restart();
            setenv("OSTREL_CONFIG", environment.configuration().c_str(), 1);
            EXPECT_EQ(environment.ask(request).outcome.rc, CMPI_RC_OK);
            EXPECT_EQ(environment.files(), without.files());
        }
    }

    /** Expects that only owner and group can access the log files, including rotated ones. */
    void expectOwnFilesOnly() const {
        for (const auto& entry : fs::directory_iterator(environment.directory())) {
            const std::string name = entry.path().filename();
            if (name.rfind("agent.", 0) == 0 && entry.path() != environment.configuration()) {
                EXPECT_EQ(entry.status().permissions() & ~ownersAndGroups, fs::perms::none) << name;
            }
        }
    }

    static constexpr fs::perms ownersAndGroups = fs::perms::owner_read | fs::perms::owner_write | fs::perms::group_read;
    const testsupport::Umask none{0};  // the log must set its file mode itself
    TestEnvironment environment;
    fs::path log;
};

TEST_F(LogFaultTest, FailuresOfTheLogDoNotFailTheRequest) {
    const RequestCase& request = requestNamed("DeleteWarranty");
    environment.restart();
    const Counts counts = environment.ask(request).counts;
    const std::string before = environment.filesAtFirst().at(warrantyFile);
    const std::string after = environment.files().at(warrantyFile);
    ASSERT_GT(counts.at(operationRename), 0) << "the log is rotated";
    const auto failOne = [&](const Fault& fault) {
        environment.restart();
        const int openBefore = openDescriptors();
        const ObservedResponse response = environment.ask(request, &fault);
        EXPECT_EQ(response.outcome.rc, CMPI_RC_OK);
        EXPECT_FALSE(response.outcome.threw);
        environment.ask(repairOf(warrantyFile));
        EXPECT_THAT(environment.files().at(warrantyFile), AnyOf(before, after));
        environment.unload();
        EXPECT_EQ(openDescriptors(), openBefore);
        expectOwnFilesOnly();
        removeLogs();
    };
    eachFault(counts, allFailures(), failOne);
}

TEST_F(LogFaultTest, ADirectoryThatIsRemovedDuringRotationIsNotCreatedAgain) {
    const fs::path directory = environment.directory() / "log";
    const fs::path away = environment.directory() / "away";
    fs::create_directory(directory);
    configure(directory / "agent.log");
    const RequestCase& request = requestNamed("DeleteWarranty");
    const Counts counts = environment.ask(request).counts;
    ASSERT_GT(counts.at(operationRename), 0) << "the log is rotated";
    for (int number = 1; number <= counts.at(operationRename); ++number) {
        SCOPED_TRACE(number);
        environment.restart();
        const Fault vanishing{operationRename, number, false, 0, [&] { fs::rename(directory, away); }};
        EXPECT_EQ(environment.ask(request, &vanishing).outcome.rc, CMPI_RC_OK);
        EXPECT_FALSE(fs::exists(directory));
        environment.unload();
        fs::remove_all(directory);
        fs::remove_all(away);
        fs::create_directory(directory);
    }
}

/** Opening the pipe would wait for a reader. */
TEST_F(LogFaultTest, APipeInPlaceOfTheLogIsNotOpenedDuringRotation) {
    const RequestCase& request = requestNamed("DeleteWarranty");
    const Fault planting{operationOpen, 1, false, 0, [&] {
                             EXPECT_FALSE(fs::exists(log)) << "the full log was renamed";
                             EXPECT_EQ(mkfifo(log.c_str(), 0600), 0);
                         }};
    EXPECT_EQ(environment.ask(request, &planting).outcome.rc, CMPI_RC_OK);
    EXPECT_TRUE(fs::is_fifo(log));
}

TEST_F(LogFaultTest, RequestsAreServedIfTheDirectoryOfTheLogIsMissing) {
    configure(environment.directory() / "missing" / "agent.log");
    expectChangesAsWithoutLog();
}

TEST_F(LogFaultTest, RequestsAreServedIfTheLogIsADirectory) {
    fs::create_directory(log);
    expectChangesAsWithoutLog();
}

TEST_F(LogFaultTest, RequestsAreServedIfTheLogCannotGrow) {
    constexpr rlim_t full = 1U << 20U;
    environment.configure("destination = \"" + log.string() + "\"\nlog_level = 9999\ntrace_level = 9999\n");
    testsupport::writeFile(log, "");
    fs::resize_file(log, full);
    {
        const testsupport::FullDisk disk(full);
        expectChangesAsWithoutLog();
    }
    EXPECT_EQ(fs::file_size(log), full);
}

TEST_F(LogFaultTest, RequestsAreServedIfTheLogIsRemovedBetweenThem) {
    environment.restart();
    environment.ask(requestNamed("Leases"));
    fs::remove(log);
    fs::create_directory(log);
    EXPECT_EQ(environment.ask(requestNamed("DeleteLease")).outcome.rc, CMPI_RC_OK);
    EXPECT_EQ(environment.files().at(leaseFile).substr(0, 2), "1\n");
}

}  // namespace
}  // namespace faults
