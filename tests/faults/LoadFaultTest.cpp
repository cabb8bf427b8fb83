#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <functional>

#include "Scene.h"

// Operations and allocations fail while the library is loaded: the agent reads its configuration then, the provider its
// files of records.

namespace faults {
namespace {

using testing::AnyOf;
using testing::IsEmpty;

class LoadFaultTest : public testing::Test {
protected:
    /** Loads the library, which then stays; its counts, and whether an exception left it. */
    Counts load(const Fault* fault) {
        const std::string file = fileOf(Scene::Library::provider);
        void* handle = nullptr;
        Counts counts;
        {
            const Armed armed = fault == nullptr ? Armed() : Armed(*fault);
            try {
                handle = dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL);
            } catch (...) {
                threw = true;
            }
            counts = armed.counts();
        }
        EXPECT_NE(handle, nullptr);
        scene.library();
        if (handle != nullptr) {
            dlclose(handle);
        }
        return counts;
    }

    void failEach(OperationKind kind, int error, const Counts& counts, const std::function<void()>& check) {
        for (const bool lasting : {false, true}) {
            for (int number = 1; number <= counts.at(kind) && !HasFailure(); ++number) {
                if (lasting && error == EINTR) {
                    return;
                }
                const Fault fault{kind, number, lasting, error, {}};
                SCOPED_TRACE(testing::PrintToString(fault));
                scene.restart();
                load(&fault);
                EXPECT_FALSE(threw) << "an exception left the library's loading";
                check();
            }
        }
    }

    Counts undisturbed() {
        scene.restart();
        const Counts counts = load(nullptr);
        leases = scene.instancesOf("VELKO_Lease");
        warranties = scene.instancesOf("VELKO_Warranty");
        return counts;
    }

    Scene scene;
    Lines leases;
    Lines warranties;
    bool threw = false;
};

/** Where the agent's configuration could not be read, the agent's directories are the defaults: only asked for. */
TEST_F(LoadFaultTest, WithoutFilesTheLibraryIsLoadedAndServes) {
    const Counts counts = undisturbed();
    ASSERT_GT(counts.at(operationOpen), 0);
    for (const FileFailure& failure : fileFailures()) {
        failEach(failure.kind, failure.error, counts, [&] {
            EXPECT_EQ(scene.ask(requestNamed("Leases")).outcome.rc, CMPI_RC_OK);
            EXPECT_EQ(scene.ask(requestNamed("Warranties")).outcome.rc, CMPI_RC_OK);
            EXPECT_EQ(scene.files(), scene.filesAtFirst());
        });
    }
}

TEST_F(LoadFaultTest, WithoutMemoryTheLibraryIsLoadedAndHasAllRecordsOrNone) {
    failEach(operationAllocate, 0, undisturbed(), [&] {
        EXPECT_THAT(scene.instancesOf("VELKO_Lease"), AnyOf(leases, IsEmpty()));
        EXPECT_THAT(scene.instancesOf("VELKO_Warranty"), AnyOf(warranties, IsEmpty()));
        EXPECT_EQ(scene.files(), scene.filesAtFirst());
    });
}

/** Fields that are not read count as missing: a failure must not be taken for the end of the file. */
TEST_F(LoadFaultTest, AFileThatCannotBeReadToItsEndGivesNoRecordInsteadOfCopies) {
    FileContents files = scene.filesAtFirst();
    files[leaseFile] = leaseRecords(200);
    const auto loadBig = [&](const Fault* fault) {
        scene.restart(files);
        const Counts counts = load(fault);
        leases = scene.instancesOf("VELKO_Lease");
        return counts;
    };
    const int reads = loadBig(nullptr).at(operationRead);
    const Lines all = leases;
    int none = 0;
    for (int number = 1; number <= reads; ++number) {
        const Fault fault{operationRead, number, false, EIO, {}};
        loadBig(&fault);
        EXPECT_THAT(leases, AnyOf(all, IsEmpty())) << fault;
        none += leases.empty() ? 1 : 0;
    }
    EXPECT_GT(none, 4) << "of the reads of the configuration, of this file and of the other";
}

}  // namespace
}  // namespace faults
