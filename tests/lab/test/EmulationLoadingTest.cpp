#include <dlfcn.h>

#include <algorithm>
#include <thread>

#include "host/operations/OperationsFixture.h"
#include "lab/emulation/ManagerEmulation.h"

// Differences in how object managers load libraries and start providers.

namespace {

using cimhost::LibraryError;
using cimhost::Request;
using cimhost::lab::Manager;
using testing::HasSubstr;
using testing::IsEmpty;

bool isLoaded(const char* library) {
    void* handle = dlopen((std::string(TEST_PROVIDERS) + "/" + library).c_str(), RTLD_NOW | RTLD_NOLOAD);
    if (handle != nullptr) {
        dlclose(handle);
    }
    return handle != nullptr;
}

class EmulationLoadingTest : public OperationsTest {
protected:
    EmulationLoadingTest() {
        add("Refusing_Thing", "Refusing", "OtherProvider", true, false);
        add("Lazy_Thing", "Lazy", "LazyProvider", true, false);
        add("Other_Both", "Anything", "OtherProvider", true, true);
        add("Together_One", "Together", "TogetherProvider", true, false);
        add("Together_Two", "Together", "TogetherProvider", true, false);
    }

    /** Enumerates a class with a new manager. @return the message of the failure; empty if there is none */
    std::string errorOf(Manager which, const char* className) {
        started.reset();
        options.behaviour = cimhost::lab::emulationOf(which);
        try {
            return manager().perform(Request::enumerateInstances(classPath(className))).status.message;
        } catch (const LibraryError& error) {
            return error.what();
        }
    }
};

TEST_F(EmulationLoadingTest, OfTwoFactoriesOneIsCalledOrNone) {
    EXPECT_THAT(errorOf(Manager::standard, "Refusing_Thing"), HasSubstr("no licence")) << "the one with the name";
    EXPECT_THAT(errorOf(Manager::sfcb, "Refusing_Thing"), IsEmpty()) << "the generic one";
    EXPECT_THAT(errorOf(Manager::openPegasus, "Refusing_Thing"),
                HasSubstr("has both Refusing_Create_InstanceMI and _Generic_Create_InstanceMI"));
    EXPECT_THAT(errorOf(Manager::openPegasus, "Other_Thing"), IsEmpty()) << "there is only the generic one";
}

TEST_F(EmulationLoadingTest, AMissingFunctionFailsAtLoadTimeOrWhenItIsCalled) {
    EXPECT_THAT(errorOf(Manager::standard, "Lazy_Thing"), HasSubstr("undefinedFunction"));
    EXPECT_EQ(errorOf(Manager::sfcb, "Lazy_Thing"), "Provider not found or not loadable");
    EXPECT_THAT(errorOf(Manager::openPegasus, "Lazy_Thing"), IsEmpty());
}

TEST_F(EmulationLoadingTest, RegisteredInterfacesMustExistAtOnceOrWhenTheyAreRequested) {
    for (const Manager each : {Manager::standard, Manager::openPegasus}) {
        EXPECT_THAT(errorOf(each, "Other_Both"), IsEmpty());
    }
    EXPECT_THAT(errorOf(Manager::sfcb, "Other_Both"), HasSubstr("neither Anything_Create_AssociationMI"));
}

TEST_F(EmulationLoadingTest, AnIdleLibraryIsUnloadedUnlessItRefuses) {
    for (const Manager each : cimhost::lab::everyManager) {
        EXPECT_THAT(errorOf(each, "Sample_Thing"), IsEmpty());
        EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Other_Thing"))).ok());
        log.clear();
        manager().idle();
        EXPECT_THAT(log, testing::ElementsAre("instance cleanup"));
        EXPECT_FALSE(isLoaded("libSampleProvider.so"));
        EXPECT_TRUE(isLoaded("libOtherProvider.so")) << "its cleanup asks to stay";
        EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Sample_Thing"))).ok());
        EXPECT_THAT(log, testing::ElementsAre("instance cleanup", "instance factory"));
    }
}

TEST_F(EmulationLoadingTest, AnIdleLibraryStaysLoadedIfOneInterfaceOrAllRefuseToBeUnloaded) {
    add("Half_Thing", "Half", "OtherProvider", true, true);
    for (const auto& [each, starts] :
         {std::pair(Manager::standard, 1U), std::pair(Manager::sfcb, 1U), std::pair(Manager::openPegasus, 2U)}) {
        log.clear();
        EXPECT_THAT(errorOf(each, "Half_Thing"), IsEmpty());
        const auto associate = [this] {
            manager().perform(Request::associatorNames(classPath("Half_Thing"), {"Half_Thing", {}, {}, {}}));
        };
        associate();
        manager().idle();
        associate();
        EXPECT_EQ(std::count(log.begin(), log.end(), "half factory"), starts);
    }
}

TEST_F(EmulationLoadingTest, ACrashLosesTheProvidersMemory) {
    options.behaviour = cimhost::lab::emulationOf(Manager::sfcb);
    EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Sample_Thing"))).ok());
    EXPECT_THAT(manager().perform(Request::enumerateInstances(classPath("Sample_Throwing"))).status.message,
                HasSubstr("died"));
    EXPECT_FALSE(isLoaded("libSampleProvider.so"));
    log.clear();
    EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Sample_Thing"))).ok())
        << "it is started again";
    EXPECT_THAT(log, testing::ElementsAre("instance factory")) << "without a cleanup before";
    started.reset();
    options.behaviour = cimhost::lab::emulationOf(Manager::openPegasus);
    EXPECT_EQ(manager().perform(Request::enumerateInstances(classPath("Sample_Throwing"))).status.rc,
              CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(isLoaded("libSampleProvider.so")) << "it stays loaded";
}

TEST_F(EmulationLoadingTest, ACrashedLibraryIsUnloadedAfterTheLastRequest) {
    options.behaviour = cimhost::lab::emulationOf(Manager::sfcb);
    EXPECT_FALSE(manager().perform(Request::enumerateInstances(classPath("Sample_CallsSample_Throwing"))).ok());
    EXPECT_FALSE(isLoaded("libSampleProvider.so"));
}

TEST_F(EmulationLoadingTest, StoppingDoesNotWaitForRunningRequests) {
    add("Echo_Thing", "Echo", "EchoProvider", true, false);
    add("Sample_CallsEcho_Thing", "Sample", "SampleProvider", true, false);
    for (const Manager each : cimhost::lab::everyManager) {
        started.reset();
        options.behaviour = cimhost::lab::emulationOf(each);
        log.clear();
        awaited = "echo factory";
        whenLogged = [this] {
            manager().stop();
            log.emplace_back("stopped");
        };
        manager().perform(Request::enumerateInstances(classPath("Sample_CallsEcho_Thing")));
        EXPECT_THAT(log,
                    testing::ElementsAre("instance factory", "echo factory", "instance cleanup at the end", "stopped"));
        const auto late = manager().perform(Request::enumerateInstances(classPath("Sample_Thing")));
        EXPECT_EQ(late.status.rc, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(late.status.message, "The object manager is stopping.");
        log.clear();
        started.reset();
        EXPECT_THAT(log, IsEmpty()) << "nothing is cleaned up twice";
    }
}

TEST_F(EmulationLoadingTest, FactoriesOfTwoClassesMayRunConcurrently) {
    options.behaviour = cimhost::lab::emulationOf(Manager::sfcb);
    manager();
    std::thread other(
        [this] { EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Together_Two"))).ok()); });
    EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Together_One"))).ok());
    other.join();
}

}  // namespace
