#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>

#include "Killing.h"
#include "TestEnvironment.h"
#include "durable/RecordFile.h"
#include "operations/LoadedLibrary.h"

// File operations or allocations fail while the gate reads an incomplete record file, when it is loaded or becomes the
// owner of the data directory: whatever the gate responds, no record is lost. A failing import loses no record either.

namespace faults {
namespace {

constexpr int preparedRecords = 4;
constexpr FaultSelection someOnce{false, 200};  ///< selects allocations

/** Does not include malloc: the C library cannot load libraries correctly after it has run out of memory. */
const std::vector<InjectedFailure> allocationFailures{{operationAllocate, 0}};

class GateLoadFaultTest : public testing::Test {
protected:
    GateLoadFaultTest() : environment(TestEnvironment::Library::gate) {}

    /** A lease file that a killed process has left, with its saved copy. */
    static FileContents damagedFiles() {
        const std::string complete = leaseRecords(preparedRecords);
        return {{leaseFile, complete.substr(0, complete.size() / 2)},
                {std::string(leaseFile) + ".saved1", complete + "saved copy 1 of Lease.dat\n"}};
    }

    void restart() {
        FileContents files = damagedFiles();
        files.merge(FileContents(environment.filesAtFirst()));
        environment.restart(files);
    }

    /** Makes a change after the process that owned the directory was killed. */
    ObservedResponse changeAfterOtherOwner(const Fault* fault) {
        environment.restart();
        leases();  // loads the provider
        std::filesystem::remove(environment.dataDirectory() / "owner");
        for (const auto& [name, content] : damagedFiles()) {
            testsupport::writeFile(environment.dataDirectory() / name, content);
        }
        return environment.ask(otherChangeOf(leaseFile), fault);
    }

    /** Loads the gate and creates its interface. Returns the operation counts. */
    Counts load(const Fault* fault) {
        const FaultInjection injection = fault == nullptr ? FaultInjection() : FaultInjection(*fault);
        bool isConnected = false;
        try {
            isConnected = environment.library().instanceMI() != nullptr;
        } catch (const std::exception&) {
            isConnected = false;
        }
        Counts counts = injection.counts();
        if (!isConnected) {
            environment.unload();  // it is loaded again at the next request
        }
        return counts;
    }

    Lines leases() {
        Lines lines = environment.instancesOf("VELKO_Lease");
        std::sort(lines.begin(), lines.end());
        return lines;
    }

    /**
     * Expects the leases from after the change if its status is OK, otherwise those from before it. If the message says
     * that the rollback failed, accepts both.
     */
    void expectStored(const ObservedResponse& response, const Lines& after, const Lines& before) {
        EXPECT_FALSE(response.outcome.threw);
        environment.unload();
        const Lines stored = leases();
        const bool isAdmitted = response.outcome.message.find("could not be rolled back") != std::string::npos;
        EXPECT_TRUE(stored == (response.outcome.rc == CMPI_RC_OK ? after : before) || (isAdmitted && stored == after))
            << response.outcome.message;
    }

    TestEnvironment environment;
};

TEST_F(GateLoadFaultTest, NoRecordIsLostIfAnOperationFailsWhileTheGateIsLoaded) {
    restart();
    const Counts counts = load(nullptr);
    const Lines complete = leases();
    environment.ask(otherChangeOf(leaseFile));
    const Lines changed = leases();
    EXPECT_NE(changed, complete);
    const auto failOne = [&](const Fault& fault) {
        restart();
        load(&fault);
        expectStored(environment.ask(otherChangeOf(leaseFile)), changed, complete);
    };
    eachFault(counts, fileFailures(), failOne);
    eachFault(counts, allocationFailures, failOne, someOnce);
}

TEST_F(GateLoadFaultTest, NoRecordIsLostIfAnOperationFailsWhileTheGateBecomesTheOwner) {
    const Counts counts = changeAfterOtherOwner(nullptr).counts;
    const Lines changed = leases();
    restart();
    const Lines complete = leases();
    EXPECT_NE(changed, complete);
    const auto failOne = [&](const Fault& fault) { expectStored(changeAfterOtherOwner(&fault), changed, complete); };
    eachFault(counts, fileFailures(), failOne, FaultSelection{false});  // the gate waits until lasting failures end
    eachFault(counts, allocationFailures, failOne, someOnce);
}

TEST_F(GateLoadFaultTest, AFailingImportLeavesTheOldOrTheNewRecords) {
    const std::string imported = leaseRecords(1);
    const durable::RecordFile file = durable::recordFileIn(environment.dataDirectory().string() + "/", leaseFile);
    Counts counts;
    const auto import = [&](const Fault* fault) {
        restart();
        const FaultInjection injection = fault == nullptr ? FaultInjection() : FaultInjection(*fault);
        bool isDone = false;
        try {
            file.recover();
            file.replace(imported);
            isDone = true;
        } catch (const std::exception&) {
            isDone = false;
        }
        counts = injection.counts();
        return isDone;
    };
    const auto failOne = [&](const Fault& fault) {
        const bool isDone = import(&fault);
        file.recover();
        const std::string left = file.content().value_or(std::string());
        EXPECT_TRUE(left == imported || (!isDone && left == leaseRecords(preparedRecords))) << left;
    };
    ASSERT_TRUE(import(nullptr));
    const Counts all = counts;
    eachFault(all, fileFailures(), failOne);
    eachFault(all, memoryFailures(), failOne, someOnce);
}

}  // namespace
}  // namespace faults
