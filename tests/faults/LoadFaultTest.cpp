#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <map>
#include <utility>

#include "TestEnvironment.h"

// File operations and allocations fail while the library is loaded: the agent reads its configuration, and the provider
// its record files. Without the configuration, the agent uses its default data directory, which has no files.

namespace faults {
namespace {

using testing::AnyOf;
using testing::ElementsAre;
using testing::Gt;
using testing::IsEmpty;
using testing::Pair;

class LoadFaultTest : public testing::Test {
protected:
    LoadFaultTest() : files(environment.filesAtFirst()) {}

    /** Loads the library with a fault, keeps it loaded, and reads its records. */
    Counts load(const Fault* fault) {
        environment.restart(files);
        const int openBefore = openDescriptors();
        const std::string file = fileOf(TestEnvironment::Library::provider);
        void* handle = nullptr;
        Counts counts;
        {
            const FaultInjection injection = fault == nullptr ? FaultInjection() : FaultInjection(*fault);
            try {
                handle = dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL);
            } catch (...) {
                ADD_FAILURE() << "an exception left the library's loading";
            }
            counts = injection.counts();
        }
        EXPECT_NE(handle, nullptr);
        EXPECT_EQ(openDescriptors(), openBefore);
        environment.library();
        if (handle != nullptr) {
            dlclose(handle);
        }
        leases = environment.instancesOf("VELKO_Lease");
        warranties = environment.instancesOf("VELKO_Warranty");
        return counts;
    }

    void makeFilesOfSeveralReads() {
        files[leaseFile] = leaseRecords(80);
        files[warrantyFile] = warrantyRecords(180);
    }

    /**
     * Expects all or no records of each class after each fault, and all records if the failed call only has to be
     * repeated.
     */
    void failEach(const std::vector<InjectedFailure>& failures, const FaultSelection& selection) {
        const Counts counts = load(nullptr);
        const Lines allLeases = leases;
        const Lines allWarranties = warranties;
        ASSERT_FALSE(allLeases.empty() || allWarranties.empty());
        const auto failOne = [&](const Fault& fault) {
            load(&fault);
            const bool isRetried = isOnFiles(fault.kind) && (fault.error == EINTR || fault.error == 0);
            if (isRetried) {
                EXPECT_EQ(leases, allLeases);
                EXPECT_EQ(warranties, allWarranties);
            }
            EXPECT_THAT(leases, AnyOf(allLeases, IsEmpty()));
            EXPECT_THAT(warranties, AnyOf(allWarranties, IsEmpty()));
            EXPECT_EQ(environment.files(), files);
            ++left[{!leases.empty(), !warranties.empty()}];
        };
        eachFault(counts, failures, failOne, selection);
    }

    TestEnvironment environment;
    FileContents files;
    Lines leases;
    Lines warranties;
    std::map<std::pair<bool, bool>, int> left;  ///< number of faults after which there were leases and warranties
};

TEST_F(LoadFaultTest, TheLibraryLoadsAllRecordsOrNoneIfAllocationsFail) {
    failEach({{operationAllocate, 0}}, {true, 400});  // malloc is called only by the dynamic linker
}

/** Fields that are not read count as missing: the library must not mistake a failure for the end of the file. */
TEST_F(LoadFaultTest, TheLibraryLoadsAllRecordsOrNoneIfFileOperationsFail) {
    makeFilesOfSeveralReads();
    failEach(fileFailures(), {});
}

TEST_F(LoadFaultTest, AFailedReadAffectsOnlyItsFile) {
    makeFilesOfSeveralReads();
    failEach({{operationRead, EIO}}, {false, 100, true});
    EXPECT_THAT(left, ElementsAre(Pair(Pair(false, false), 2), Pair(Pair(false, true), Gt(1)),
                                  Pair(Pair(true, false), Gt(1)), Pair(Pair(true, true), 2)))
        << "the agent's configuration, leases, warranties, and the log's configuration";
}

}  // namespace
}  // namespace faults
