#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

#include "Killing.h"
#include "TestEnvironment.h"
#include "operations/LoadedLibrary.h"

// The gate is loaded over an incomplete record file while file operations fail: whatever it then answers, no record is
// lost.

namespace faults {
namespace {

constexpr int preparedRecords = 4;

class GateLoadFaultTest : public testing::Test {
protected:
    GateLoadFaultTest() : environment(TestEnvironment::Library::gate) {}

    /** A lease file that a killed process has left, with its saved copy. */
    void restart() {
        FileContents files = environment.filesAtFirst();
        const std::string complete = leaseRecords(preparedRecords);
        files[leaseFile] = complete.substr(0, complete.size() / 2);
        files[std::string(leaseFile) + ".saved1"] = complete + "saved copy 1 of Lease.dat\n";
        environment.restart(files);
    }

    /** Loads the gate and connects it. Returns the operations that it needs. */
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

    TestEnvironment environment;
};

TEST_F(GateLoadFaultTest, NoRecordIsLostWhateverFailsWhileItIsLoaded) {
    restart();
    const Counts counts = load(nullptr);
    const Lines complete = leases();
    environment.ask(otherChangeOf(leaseFile));
    const Lines changed = leases();
    EXPECT_NE(changed, complete);
    eachFault(counts, fileFailures(), [&](const Fault& fault) {
        restart();
        load(&fault);
        const Response response = environment.ask(otherChangeOf(leaseFile));
        environment.unload();
        EXPECT_EQ(leases(), response.outcome.rc == CMPI_RC_OK ? changed : complete) << response.outcome.message;
    });
}

}  // namespace
}  // namespace faults
