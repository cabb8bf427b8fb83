#include <dlfcn.h>

#include <thread>

#include "OperationsFixture.h"
#include "operations/RequestRunner.h"
#include "support/Files.h"
#include "support/TemporaryDirectory.h"

namespace {

using cimhost::LibraryError;
using cimhost::Request;

class LoadingTest : public OperationsTest {
protected:
    void ask(const char* className) { manager().perform(Request::enumerateInstances(classPath(className))); }

    /** The message of the LibraryError of a request for a class; empty if there is none. */
    std::string errorOf(const char* className) {
        try {
            ask(className);
            return {};
        } catch (const LibraryError& error) {
            return error.what();
        }
    }

    static bool isLoaded(const char* library) {
        void* handle = dlopen((std::string(TEST_PROVIDERS) + "/" + library).c_str(), RTLD_NOW | RTLD_NOLOAD);
        if (handle != nullptr) {
            dlclose(handle);
        }
        return handle != nullptr;
    }
};

TEST_F(LoadingTest, FactoriesAreCalledOncePerInterface) {
    ask("Sample_Thing");
    ask("Sample_Silent");
    manager().perform(Request::associatorNames(named("Sample_Thing", "x"), {}));
    manager().perform(Request::associatorNames(named("Sample_Thing", "x"), {}));
    EXPECT_THAT(log, testing::ElementsAre("instance factory", "association factory"));
}

TEST_F(LoadingTest, NothingIsLoadedBeforeItIsNeeded) {
    manager();
    EXPECT_FALSE(isLoaded("libSampleProvider.so"));
    ask("Missing");
    EXPECT_FALSE(isLoaded("libSampleProvider.so"));
}

TEST_F(LoadingTest, TheDestructorCleansUpProvidersAndUnloadsLibraries) {
    ask("Sample_Thing");
    manager().perform(Request::associatorNames(named("Sample_Thing", "x"), {}));
    EXPECT_TRUE(isLoaded("libSampleProvider.so"));
    log.clear();
    started.reset();
    EXPECT_THAT(log, testing::ElementsAre("instance cleanup at the end", "association cleanup at the end"));
    EXPECT_FALSE(isLoaded("libSampleProvider.so"));
}

TEST_F(LoadingTest, AProviderThatRefusesToBeUnloadedStaysLoaded) {
    ask("Other_Thing");
    started.reset();
    EXPECT_TRUE(isLoaded("libOtherProvider.so"));
}

TEST_F(LoadingTest, TheGenericFactoryReceivesTheNameOfTheProvider) {
    const auto found = manager().perform(Request::enumerateInstances(classPath("Other_Thing")));
    ASSERT_EQ(found.instances.size(), 1U);
    EXPECT_EQ(testsupport::stringOf(found.instance().properties, "Provider"), "Anything");
}

TEST_F(LoadingTest, AMissingFunctionIsNotSupported) {
    const auto found = manager().perform(Request::getInstance(classPath("Other_Thing")));
    EXPECT_EQ(found.status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(LoadingTest, AMissingLibraryIsALibraryError) {
    EXPECT_EQ(errorOf("Unloadable"),
              "libDoesNotExist.so is in none of these directories: /nonexistent, " TEST_PROVIDERS);
}

TEST_F(LoadingTest, AFileThatIsNoLibraryIsALibraryError) {
    const testsupport::TemporaryDirectory folder;
    const std::string file = folder.withSlash() + "libText.so";
    testsupport::writeFile(file, "no library");
    add("Text", "Text", file.c_str(), true, false);
    EXPECT_THAT(errorOf("Text"), testing::HasSubstr(file));
}

TEST_F(LoadingTest, AMissingFactoryIsALibraryError) {
    add("Wrong_Thing", "Wrong", "SampleProvider", true, false);
    EXPECT_THAT(errorOf("Wrong_Thing"), testing::HasSubstr("Wrong_Create_InstanceMI"));
}

TEST_F(LoadingTest, AFailingFactoryIsALibraryError) {
    for (const char* provider : {"Refusing", "Null", "Throwing", "Selfish"}) {
        add((std::string(provider) + "_Thing").c_str(), provider, "OtherProvider", true, false);
    }
    EXPECT_THAT(errorOf("Refusing_Thing"), testing::HasSubstr("no licence"));
    EXPECT_THAT(errorOf("Null_Thing"), testing::HasSubstr("no interface"));
    EXPECT_THAT(errorOf("Throwing_Thing"), testing::HasSubstr("no luck"));
    EXPECT_THAT(errorOf("Selfish_Thing"), testing::HasSubstr("sent a request to itself"));
}

TEST_F(LoadingTest, AFailedFactoryIsTriedAgain) {
    add("Late_Thing", "Late", "OtherProvider", true, false);
    EXPECT_NE(errorOf("Late_Thing"), "");
    EXPECT_NE(errorOf("Late_Thing"), "");
    EXPECT_EQ(errorOf("Late_Thing"), "");
}

TEST_F(LoadingTest, SeveralThreadsStartAProviderOnce) {
    manager();
    const auto work = [this] {
        for (int i = 0; i < 50; ++i) {
            EXPECT_TRUE(manager().perform(Request::enumerateInstances(classPath("Sample_CallsOther_Thing"))).ok());
        }
    };
    std::thread first(work);
    std::thread second(work);
    first.join();
    second.join();
    EXPECT_THAT(log, testing::ElementsAre("instance factory"));
}

TEST_F(LoadingTest, ALaterRegistrationReplacesAnEarlierOne) {
    add("SAMPLE_THING", "Anything", "OtherProvider", true, false);
    const auto found = manager().perform(Request::enumerateInstances(classPath("Sample_Thing")));
    ASSERT_EQ(found.instances.size(), 1U);
    EXPECT_EQ(found.instance().path.className, "Other_Thing");
}

TEST_F(LoadingTest, AnInterfaceRejectsOperationsOfTheOtherKind) {
    cimhost::Request request;
    request.operation = cimhost::Operation::associators;
    CMPIInstanceMI none{};
    EXPECT_THROW(runRequest(manager().broker(), &none, request), std::invalid_argument);
}

}  // namespace
