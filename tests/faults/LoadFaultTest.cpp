#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <map>
#include <utility>

#include "Scene.h"

// Operations and allocations fail while the library is loaded: the agent reads its configuration then, the provider its
// files of records. Without the configuration the data directory is another one, where no files are.

namespace faults {
namespace {

using testing::AnyOf;
using testing::ElementsAre;
using testing::Gt;
using testing::IsEmpty;
using testing::Pair;

class LoadFaultTest : public testing::Test {
protected:
    LoadFaultTest() : files(scene.filesAtFirst()) {}

    /** Loads the library anew, which then stays, and looks at what it has. */
    Counts load(const Fault* fault) {
        scene.restart(files);
        const int openBefore = openDescriptors();
        const std::string file = fileOf(Scene::Library::provider);
        void* handle = nullptr;
        Counts counts;
        {
            const Armed armed = fault == nullptr ? Armed() : Armed(*fault);
            try {
                handle = dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL);
            } catch (...) {
                ADD_FAILURE() << "an exception left the library's loading";
            }
            counts = armed.counts();
        }
        EXPECT_NE(handle, nullptr);
        EXPECT_EQ(openDescriptors(), openBefore);
        scene.library();
        if (handle != nullptr) {
            dlclose(handle);
        }
        leases = scene.instancesOf("VELKO_Lease");
        warranties = scene.instancesOf("VELKO_Warranty");
        return counts;
    }

    void makeFilesOfSeveralReads() {
        files[leaseFile] = leaseRecords(80);
        files[warrantyFile] = warrantyRecords(180);
    }

    /** All records or none of each class, whatever fails; all if what fails is only to be done again. */
    void failEach(const std::vector<Failure>& failures, const Extent& extent) {
        const Counts counts = load(nullptr);
        const Lines allLeases = leases;
        const Lines allWarranties = warranties;
        ASSERT_FALSE(allLeases.empty() || allWarranties.empty());
        const auto failOne = [&](const Fault& fault) {
            load(&fault);
            const bool isToBeDoneAgain = isOnFiles(fault.kind) && (fault.error == EINTR || fault.error == 0);
            if (isToBeDoneAgain) {
                EXPECT_EQ(leases, allLeases);
                EXPECT_EQ(warranties, allWarranties);
            }
            EXPECT_THAT(leases, AnyOf(allLeases, IsEmpty()));
            EXPECT_THAT(warranties, AnyOf(allWarranties, IsEmpty()));
            EXPECT_EQ(scene.files(), files);
            ++left[{!leases.empty(), !warranties.empty()}];
        };
        eachFault(counts, failures, failOne, extent);
    }

    Scene scene;
    FileContents files;
    Lines leases;
    Lines warranties;
    std::map<std::pair<bool, bool>, int> left;  ///< how often there were leases and warranties after a fault
};

TEST_F(LoadFaultTest, WithoutMemoryTheLibraryIsLoadedAndHasAllRecordsOrNone) {
    failEach({{operationAllocate, 0}}, {});  // what the dynamic linker takes by malloc is not the library's
}

/** Fields that are not read count as missing: a failure must not be taken for the end of the file. */
TEST_F(LoadFaultTest, WithoutFilesTheLibraryIsLoadedAndHasAllRecordsOrNoneInsteadOfCopies) {
    makeFilesOfSeveralReads();
    failEach(fileFailures(), {});
}

TEST_F(LoadFaultTest, EachReadThatFailsCostsItsOwnFileOnly) {
    makeFilesOfSeveralReads();
    failEach({{operationRead, EIO}}, {false, 100, true});
    EXPECT_THAT(left, ElementsAre(Pair(Pair(false, false), 2), Pair(Pair(false, true), Gt(1)),
                                  Pair(Pair(true, false), Gt(1)), Pair(Pair(true, true), 2)))
        << "the agent's configuration, leases, warranties, and the log's configuration";
}

}  // namespace
}  // namespace faults
