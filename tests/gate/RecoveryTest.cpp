#include <linux/capability.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cstdlib>
#include <regex>
#include <set>

#include "GateFixture.h"
#include "SimulatedTime.h"
#include "support/Files.h"

// Recovery of record files before the provider reads them.

namespace gatetest {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::HasSubstr;
using testsupport::readFile;
using testsupport::writeFile;

/** Returns the errors that the gate has logged, in one string. */
std::string loggedErrors() {
    std::string errors;
    for (const auto& record : agentEnvironment::log()) {
        if (record.level == 3000 && record.logger == "Tarvik.LeaseAndWarrantyGate" && record.channel == "log") {
            errors += record.text + "\n";
        }
    }
    return errors;
}

/** Makes a directory unwritable during the lifetime of this object, even if the process runs as root. */
class UnwritableDirectory {
public:
    explicit UnwritableDirectory(const fs::path& path) : directory(path), before(fs::status(path).permissions()) {
        fs::permissions(directory.parent_path(), fs::perms(0755));
        fs::permissions(directory, fs::perms(0555));
        wasRoot = geteuid() == 0 && setresuid(unprivileged, unprivileged, 0) == 0;
        if (wasRoot && access(testsupport::underTest(GATE_LIBRARY).c_str(), R_OK) != 0) {
            permitReading();
        }
    }
    ~UnwritableDirectory() {
        if (wasRoot && setresuid(0, 0, 0) != 0) {
            std::abort();
        }
        fs::permissions(directory, before);
    }
    UnwritableDirectory(const UnwritableDirectory&) = delete;
    UnwritableDirectory& operator=(const UnwritableDirectory&) = delete;

private:
    static constexpr uid_t unprivileged = 65534;

    /**
     * Permits this thread to read all files, since perhaps only root can read the directory of the libraries. The
     * thread still cannot write root's files.
     */
    static void permitReading() {
        __user_cap_header_struct header{_LINUX_CAPABILITY_VERSION_3, 0};
        __user_cap_data_struct sets[_LINUX_CAPABILITY_U32S_3]{};
        if (syscall(SYS_capget, &header, sets) == 0) {
            sets[0].effective = sets[0].permitted & (1U << CAP_DAC_READ_SEARCH);
            EXPECT_EQ(syscall(SYS_capset, &header, sets), 0);
        }
    }

    fs::path directory;
    fs::perms before;
    bool wasRoot = false;
};

using RecoveryTest = GateTest;

TEST_F(RecoveryTest, AnIncompleteFileIsRestoredAndTheRestorationIsLogged) {
    create("L1", {named("Lessor", text("ACME"))});
    create("L2");
    unload();
    const std::string complete = readFile(dataFile("Lease.dat"));
    for (std::size_t size = 0; size < complete.size(); size += 7) {
        agentEnvironment::forgetLog();
        writeFile(dataFile("Lease.dat"), complete.substr(0, size));
        EXPECT_THAT(identifiers(), ElementsAre("L1", "L2")) << size;
        EXPECT_THAT(loggedErrors(), HasSubstr("It was restored from the saved copy of 20"));
        unload();
        EXPECT_EQ(readFile(dataFile("Lease.dat")), complete);
        writeFile(dataFile("Lease.dat.saved1"), complete + "saved copy 1 of Lease.dat\n");
    }
}

TEST_F(RecoveryTest, AChangeAfterARestorationKeepsAllRecords) {
    create("L1");
    create("L2");
    unload();
    writeFile(dataFile("Lease.dat"), "2\nL1\n");
    EXPECT_THAT(create("L3"), isAnswered(1));
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2", "L3"));
}

TEST_F(RecoveryTest, AnEditedFileIsRead) {
    create("L1", {named("Lessor", text("ACME"))});
    unload();
    writeFile(dataFile("Lease.dat"), std::regex_replace(readFile(dataFile("Lease.dat")), std::regex("ACME"), "Other"));
    fs::last_write_time(dataFile("Lease.dat"), fs::file_time_type::clock::now() - std::chrono::hours(1));
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "Other");
    EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(1))}), isDone());
    unload();
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "Other");
}

TEST_F(RecoveryTest, WithoutASavedCopyTheDamagedFileIsKeptAndItsRecordCountsAreLogged) {
    create("L1");
    create("L2");
    unload();
    const std::string complete = readFile(dataFile("Lease.dat"));
    const std::string cut = complete.substr(0, complete.size() / 2 + 5);
    fs::remove(dataFile("Lease.dat.saved1"));
    fs::remove(dataFile("Lease.dat.saved2"));
    writeFile(dataFile("Lease.dat"), cut);
    agentEnvironment::forgetLog();
    gate().instanceMI();
    EXPECT_THAT(loggedErrors(), HasSubstr("Lease.dat was incomplete (records declared: 2, present: 1)."));
    EXPECT_EQ(readFile(dataFile("Lease.dat.damaged")), cut);
}

TEST_F(RecoveryTest, RecordsInAnUnwritableDirectoryCanBeReadButNotChanged) {
    create("L1", {named("Lessor", text("ACME"))});
    const std::string complete = readFile(dataFile("Lease.dat"));
    fs::permissions(dataFile("Lease.dat"), fs::perms(0666));
    {
        const UnwritableDirectory unwritable(agentEnvironment::dataDirectory());
        EXPECT_THAT(create("L2"), isRefused(CMPI_RC_ERR_FAILED, "Permission denied"));
        EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(1))}), isRefused(CMPI_RC_ERR_FAILED, "Permission denied"));
        EXPECT_THAT(remove("L1"), isRefused(CMPI_RC_ERR_FAILED, "Permission denied"));
        EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
    }
    EXPECT_EQ(readFile(dataFile("Lease.dat")), complete);
    EXPECT_THAT(create("L2"), isAnswered(1));
}

TEST_F(RecoveryTest, AProcessWithoutWritePermissionNeitherRestoresNorReadsAnIncompleteFile) {
    create("L1");
    unload();
    const std::string complete = readFile(dataFile("Lease.dat"));
    fs::permissions(dataFile("Lease.dat"), fs::perms(0644));
    fs::permissions(dataFile("Lease.dat.saved1"), fs::perms(0644));
    fs::permissions(dataFile("Lease.dat.saved2"), fs::perms(0644));
    writeFile(dataFile("Lease.dat"), "1\nL1\n");
    agentEnvironment::forgetLog();
    gate();
    {
        const UnwritableDirectory unwritable(agentEnvironment::dataDirectory());
        const SimulatedTime waiting;
        EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isRefused(CMPI_RC_ERR_FAILED, "are incomplete"));
    }
    EXPECT_EQ(readFile(dataFile("Lease.dat")), "1\nL1\n");
    EXPECT_EQ(loggedErrors().find("restored"), std::string::npos) << loggedErrors();
    EXPECT_THAT(identifiers(), ElementsAre("L1")) << "the process has write permission again";
    EXPECT_THAT(loggedErrors(), HasSubstr("It was restored from the saved copy"));
    EXPECT_EQ(readFile(dataFile("Lease.dat")), complete);
}

/** Returns the names of the files in the data directory. */
std::set<std::string> namesInDirectory() {
    std::set<std::string> names;
    for (const auto& entry : fs::directory_iterator(agentEnvironment::dataDirectory())) {
        names.insert(entry.path().filename());
    }
    return names;
}

TEST_F(RecoveryTest, AReaderReportsThatTheDirectoryWasRemoved) {
    create("L1");
    unload();
    fs::permissions(dataFile("Lease.dat"), fs::perms(0644));
    gate();
    {
        const UnwritableDirectory unwritable(agentEnvironment::dataDirectory());
        EXPECT_THAT(identifiers(), ElementsAre("L1"));
    }
    const fs::path away = agentEnvironment::directory() / "away";
    fs::rename(agentEnvironment::dataDirectory(), away);
    EXPECT_THAT(gate().enumerateInstances(classPath("VELKO_Lease")), isRefused(CMPI_RC_ERR_FAILED, "were removed"));
    fs::rename(away, agentEnvironment::dataDirectory());
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(RecoveryTest, AProcessWithoutWritePermissionReadsWithoutALockFileOrNewCopies) {
    for (const bool hasOwnerFile : {true, false}) {
        create("L1");
        unload();
        fs::permissions(dataFile("Lease.dat"), fs::perms(0644));
        if (!hasOwnerFile) {
            fs::remove(dataFile("owner"));
        }
        const std::set<std::string> before = namesInDirectory();
        gate();
        {
            const UnwritableDirectory unwritable(agentEnvironment::dataDirectory());
            EXPECT_THAT(identifiers(), ElementsAre("L1"));
            EXPECT_THAT(create("L2"), isRefused(CMPI_RC_ERR_FAILED, "cannot be changed by this process"));
        }
        EXPECT_EQ(namesInDirectory(), before);
        EXPECT_THAT(create("L2"), isAnswered(1)) << "this process becomes the owner";
        EXPECT_THAT(remove("L1"), isDone());
        EXPECT_THAT(remove("L2"), isDone());
    }
}

}  // namespace
}  // namespace gatetest
