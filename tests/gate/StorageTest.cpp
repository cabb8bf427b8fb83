#include <dlfcn.h>
#include <sys/stat.h>
#include <sys/statvfs.h>

#include <cerrno>
#include <chrono>
#include <cstdio>
#include <regex>
#include <set>

#include "GateFixture.h"
#include "support/Files.h"
#include "support/FullDisk.h"

// Changes that cannot be stored.

namespace gatetest {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testsupport::FullDisk;
using testsupport::readFile;

using StorageTest = GateTest;

/** Makes file systems appear full during the lifetime of this object. */
struct FullFileSystem {
    static inline int count = 0;

    FullFileSystem() { ++count; }
    ~FullFileSystem() { --count; }
    FullFileSystem(const FullFileSystem&) = delete;
    FullFileSystem& operator=(const FullFileSystem&) = delete;
};

/**
 * Controls whether files can be opened for writing during the lifetime of this object. For each '+' of the string, a
 * call succeeds; for each '-', a call fails. The last character applies to all later calls.
 */
struct OpenResults {
    static inline const char* results = "+";

    explicit OpenResults(const char* itsResults) { results = itsResults; }
    ~OpenResults() { results = "+"; }
    OpenResults(const OpenResults&) = delete;
    OpenResults& operator=(const OpenResults&) = delete;

    static bool take() {
        const bool isOpened = *results == '+';
        results += results[1] != '\0' ? 1 : 0;
        return isOpened;
    }
};

/**
 * During the lifetime of this object, only the gate can read record files, as if the provider had no free file
 * descriptor.
 */
struct UnreadableRecords {
    static inline int count = 0;

    UnreadableRecords() { ++count; }
    ~UnreadableRecords() { --count; }
    UnreadableRecords(const UnreadableRecords&) = delete;
    UnreadableRecords& operator=(const UnreadableRecords&) = delete;
};

/** Returns the outcomes of a creation, a modification and a deletion of leases. */
std::vector<Outcome> changes(testsupport::ProviderLibrary& gate) {
    const auto with = [](const std::string& id) {
        return testsupport::instance(keyedPath(lease, id), {named("LeaseTerm", uint32(9))});
    };
    return {gate.createInstance(keyedPath(lease, "L2"), with("L2")),
            gate.modifyInstance(keyedPath(lease, "L1"), with("L1")), gate.deleteInstance(keyedPath(lease, "L1"))};
}

TEST_F(StorageTest, ChangesAreRefusedWithoutADataDirectory) {
    create("L1", {named("LeaseTerm", uint32(1))});
    fs::remove_all(agentEnvironment::dataDirectory());
    for (const Outcome& outcome : changes(gate())) {
        EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_FAILED, dataFile("Lease.dat").string()));
        EXPECT_THAT(outcome.message, HasSubstr("No such file or directory"));
    }
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "1");
    fs::create_directory(agentEnvironment::dataDirectory());
    EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(2))}), isDone()) << "after the directory exists again";
    EXPECT_THAT(readFile(dataFile("Lease.dat")), HasSubstr("L1\n"));
}

TEST_F(StorageTest, RecordsOfAnEmptiedDirectoryAreStoredByTheNextChange) {
    create("L1", {named("LeaseTerm", uint32(1))});
    create("L2");
    for (const bool isChangedBefore : {true, false}) {
        if (!isChangedBefore) {
            unload();
            gate().instanceMI();
        }
        fs::remove_all(agentEnvironment::dataDirectory());
        fs::create_directory(agentEnvironment::dataDirectory());
        {
            const FullDisk disk(10);
            EXPECT_THAT(create("L3"), isRefused(CMPI_RC_ERR_FAILED, "Lease.dat"));
        }
        EXPECT_THAT(identifiers(), ElementsAre("L1", "L2"));
        EXPECT_THAT(create("L3"), isAnswered(1));
        EXPECT_THAT(remove("L3"), isDone());
        unload();
        EXPECT_THAT(identifiers(), ElementsAre("L1", "L2"));
        EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "1");
    }
}

TEST_F(StorageTest, RecordsAreNotReadAgainFromADirectoryThatLacksTheirFiles) {
    create("L1");
    const std::string stored = readFile(dataFile("Lease.dat"));
    unload();
    gate().instanceMI();
    testsupport::writeFile(dataFile("Lease.dat"), "0\n");
    EXPECT_THAT(create("L2"), isRefused(CMPI_RC_ERR_FAILED, "It is read again"));
    fs::remove_all(agentEnvironment::dataDirectory());
    fs::create_directory(agentEnvironment::dataDirectory());
    for (const Outcome& outcome : {gate().enumerateInstances(classPath(lease)), create("L2")}) {
        EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_FAILED, "The record files were removed."));
    }
    testsupport::writeFile(dataFile("Lease.dat"), stored);
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(StorageTest, AFileThatCannotBeOpenedIsNamedAndNothingChanges) {
    create("L1", {named("LeaseTerm", uint32(1))});
    fs::remove(dataFile("Lease.dat"));
    fs::create_directory(dataFile("Lease.dat"));
    for (const Outcome& outcome : changes(gate())) {
        EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_FAILED, "Lease.dat"));
    }
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "1");
}

TEST_F(StorageTest, RecordsThatTheProviderCouldNotReadAreNotReportedAsMissing) {
    create(firstNode, {named("Lessor", text("ACME"))});
    create(firstNode, {}, warranty);
    unload();
    {
        const UnreadableRecords unreadable;
        for (const char* name : {lease, warranty}) {
            const auto isUnread = isRefused(CMPI_RC_ERR_FAILED, std::string("could not read the records of ") + name);
            const std::string setting = name == lease ? leaseSetting : warrantySetting;
            EXPECT_THAT(gate().enumerateInstances(classPath(name)), isUnread);
            EXPECT_THAT(gate().enumerateInstanceNames(classPath(name)), isUnread);
            EXPECT_THAT(gate().getInstance(keyedPath(name, firstNode)), isUnread);
            EXPECT_THAT(gate().associators(computerPath("alpha"), {setting, {}, {}, {}}), isUnread);
            EXPECT_THAT(gate().associatorNames(computerPath("alpha"), {setting, {}, {}, {}}), isUnread);
            EXPECT_THAT(remove(firstNode, name), isUnread);
            EXPECT_THAT(create("L2", {}, name), isUnread);
        }
        EXPECT_THAT(gate().enumerateInstances(classPath(agent)), isAnswered(1)) << "this class has no record file";
        EXPECT_THAT(remove(firstNode), isRefused(CMPI_RC_ERR_FAILED, "repeat the request"));
    }
    EXPECT_EQ(valueIn(instanceOf(firstNode), "Lessor"), "ACME");
    EXPECT_THAT(identifiers(warranty), ElementsAre(firstNode));
}

TEST_F(StorageTest, OnlyRegularFilesAreWritten) {
    create("L1");
    fs::remove(dataFile("Lease.dat"));
    ASSERT_EQ(mkfifo(dataFile("Lease.dat").c_str(), 0600), 0);
    EXPECT_THAT(create("L2"), isRefused(CMPI_RC_ERR_FAILED, "not a regular file"));
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(StorageTest, AFullDiskRollsBackANewRecord) {
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

TEST_F(StorageTest, AFullDiskRollsBackANewRecordWithValues) {
    create("L1", {named("LeaseTerm", uint32(1))});
    const std::string stored = readFile(dataFile("Lease.dat"));
    const FullDisk disk(2 * stored.size() + 10);
    const Outcome outcome = create("L2", {named("Lessor", text(std::string(100, 'A')))});
    EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_FAILED, "disk may be full"));
    EXPECT_THAT(outcome.message, testing::Not(HasSubstr("damaged"))) << "the file is complete again";
    EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(StorageTest, AFullDiskRollsBackAModification) {
    create("L1", {named("Lessor", text("ACME"))});
    create("L2");
    const std::string stored = readFile(dataFile("Lease.dat"));
    {
        const FullDisk disk(stored.size() + 10);
        EXPECT_THAT(modify("L1", {named("Lessor", text(std::string(100, 'A')))}),
                    isRefused(CMPI_RC_ERR_FAILED, "disk may be full"));
    }
    EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
}

/** Returns every property of every lease, regardless of the order. */
std::multiset<std::string> content(const Outcome& leases) {
    std::multiset<std::string> shown;
    for (const Instance& instance : leases.instances()) {
        std::string text;
        for (const NamedValue& property : instance.properties) {
            text += property.name.string() + "=" + valueIn(instance, property.name).value_or("(null)") + ";";
        }
        shown.insert(text);
    }
    return shown;
}

TEST_F(StorageTest, ADeletionThatCannotBeStoredIsRolledBack) {
    create("L1", {named("Lessor", text("ACME")), named("LeaseTerm", uint32(12)),
                  named("RenewalOption", testsupport::boolean(true)),
                  named("BaseTermCommencementDate", testsupport::dateTime("20260101000000.000000+060"))});
    create("L2");
    create("L3", {named("Lessor", text("Other"))});
    const auto before = content(gate().enumerateInstances(classPath(lease)));
    const std::string stored = readFile(dataFile("Lease.dat"));
    {
        const FullDisk disk(10);
        EXPECT_THAT(remove("L1"), isRefused(CMPI_RC_ERR_FAILED, "disk may be full"));
    }
    EXPECT_EQ(content(gate().enumerateInstances(classPath(lease))), before);
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2", "L3"));
    EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2", "L3"));
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
    EXPECT_THAT(remove("L1"), isDone());
}

TEST_F(StorageTest, RollingBackNeedsNoDiskSpace) {
    create("L1", {named("Lessor", text("ACME"))});
    const std::string stored = readFile(dataFile("Lease.dat"));
    const FullDisk disk(10);
    EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(1))}), isRefused(CMPI_RC_ERR_FAILED, "disk may be full"));
    EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
    EXPECT_THAT(create("L2"), isRefused(CMPI_RC_ERR_FAILED, "Lease.dat.saved")) << "there is no space for a copy";
    EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "0");
}

TEST_F(StorageTest, RequestsAreRefusedWhileTheProviderCannotBeReloaded) {
    create("L1", {named("Lessor", text("ACME"))});
    void* const other = dlopen(testsupport::underTest(PROVIDER_LIBRARY).c_str(), RTLD_NOW);
    ASSERT_NE(other, nullptr);
    {
        const FullDisk disk(10);
        EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(1))}), isRefused(CMPI_RC_ERR_FAILED, "disk may be full"));
    }
    EXPECT_THAT(modify("L1", {named("Lessor", text("Other"))}),
                isRefused(CMPI_RC_ERR_FAILED, "also loaded without the gate"));
    dlclose(other);
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "0");
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
}

TEST_F(StorageTest, AFileThatWasNotWrittenIsReported) {
    create("L1", {named("Lessor", text("ACME"))});
    const std::string stored = readFile(dataFile("Lease.dat"));
    for (const char* lessor : {"Other", ""}) {
        const OpenResults none("-");
        const Outcome outcome = modify("L1", {named("Lessor", text(lessor))});
        EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_FAILED, "Lease.dat was not written"));
        EXPECT_THAT(outcome.message, testing::Not(HasSubstr("damaged"))) << "the file never changed";
        EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
    }
    EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
}

TEST_F(StorageTest, AFileThatWasNotWrittenIsReportedEvenIfLossyValuesArePermitted) {
    const RefusalOff permitted;
    create("L1", {named("Lessor", text("A_B"))});
    EXPECT_THAT(modify("L1", {named("Lessor", text("A B"))}), isDone()) << "both values are equal in the file";
    const OpenResults none("-");
    EXPECT_THAT(modify("L1", {named("Lessor", text("Other"))}),
                isRefused(CMPI_RC_ERR_FAILED, "Lease.dat was not written"));
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "A B");
}

TEST_F(StorageTest, APartiallyStoredCreationIsRolledBack) {
    create("L1");
    const std::string stored = readFile(dataFile("Lease.dat"));
    {
        const OpenResults first("+-");
        EXPECT_THAT(create("L2", {named("Lessor", text("ACME"))}),
                    isRefused(CMPI_RC_ERR_FAILED, "Lease.dat was not written"));
    }
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
}

TEST_F(StorageTest, ADeletionThatWasNotWrittenIsRolledBack) {
    create("L1", {named("Lessor", text("ACME"))});
    {
        const OpenResults none("-");
        EXPECT_THAT(remove("L1"), isRefused(CMPI_RC_ERR_FAILED, "Lease.dat was not written"));
    }
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
    EXPECT_THAT(remove("L1"), isDone());
}

TEST_F(StorageTest, AChangeToAValueThatTheFileAlreadyHasSucceeds) {
    create("L1", {named("Lessor", text("ACME"))});
    const auto byHand = std::regex_replace(readFile(dataFile("Lease.dat")), std::regex("ACME"), "Other");
    testsupport::writeFile(dataFile("Lease.dat"), byHand);
    fs::last_write_time(dataFile("Lease.dat"), fs::file_time_type::clock::now() - std::chrono::hours(1));
    EXPECT_THAT(modify("L1", {named("Lessor", text("Other"))}), isDone());
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "Other");
    EXPECT_EQ(readFile(dataFile("Lease.dat")), byHand);
}

TEST_F(StorageTest, ChangesThatNeedSpaceAreRefusedBeforeWritingToAFullFileSystem) {
    create("L1", {named("LeaseTerm", uint32(1))});
    const ObjectPath path = gate().enumerateInstanceNames(classPath(asset)).paths().front();
    const std::string stored = readFile(dataFile("Lease.dat"));
    const auto written = fs::last_write_time(dataFile("Lease.dat"));
    {
        const FullFileSystem room;
        EXPECT_THAT(create("L2"), isRefused(CMPI_RC_ERR_FAILED, "No space left"));
        EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(9))}), isRefused(CMPI_RC_ERR_FAILED, "No space left"));
        EXPECT_THAT(gate().modifyInstance(path, testsupport::instance(path, {named("AssetNumber", text("A1"))})),
                    isRefused(CMPI_RC_ERR_FAILED, "No space left"));
        EXPECT_EQ(readFile(dataFile("Lease.dat")), stored);
        EXPECT_EQ(fs::last_write_time(dataFile("Lease.dat")), written);
        EXPECT_THAT(remove("L1"), isDone()) << "a deletion frees space";
    }
    EXPECT_THAT(create("L2"), isAnswered(1));
}

TEST_F(StorageTest, AssetDataThatCannotBeStoredAreReportedAndUnchanged) {
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

TEST_F(StorageTest, TheNextChangeRepairsADamagedFile) {
    create("L1");
    testsupport::writeFile(dataFile("Lease.dat"), "7\nL1\n");
    EXPECT_THAT(create("L2"), isAnswered(1));
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2"));
}

}  // namespace
}  // namespace gatetest

// These functions replace those of the C library, also for the libraries under test.

namespace {

/** Opens a file, or fails with EMFILE. */
FILE* openIfAllowed(const char* function, const char* path, const char* mode) {
    using Function = FILE* (*)(const char*, const char*);
    const std::filesystem::path name = std::filesystem::path(path).filename();
    const bool isRecordFile = name == "Lease.dat" || name == "Warranty.dat";
    if (*mode == 'r' ? isRecordFile && gatetest::UnreadableRecords::count > 0
                     : *mode == 'w' && !gatetest::OpenResults::take()) {
        errno = EMFILE;
        return nullptr;
    }
    return reinterpret_cast<Function>(dlsym(RTLD_NEXT, function))(path, mode);
}

}  // namespace

extern "C" __attribute__((visibility("default"))) FILE* fopen(const char* path, const char* mode) {
    return openIfAllowed("fopen", path, mode);
}

extern "C" __attribute__((visibility("default"))) FILE* fopen64(const char* path, const char* mode) {
    return openIfAllowed("fopen64", path, mode);
}

extern "C" __attribute__((visibility("default"))) int statvfs(const char* path, struct statvfs* system) noexcept {
    static const auto real = reinterpret_cast<int (*)(const char*, struct statvfs*)>(dlsym(RTLD_NEXT, "statvfs"));
    const int answer = real(path, system);
    if (gatetest::FullFileSystem::count > 0) {
        system->f_bfree = 0;
        system->f_bavail = 0;
    }
    return answer;
}
