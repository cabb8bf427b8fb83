#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "operations/LoadedLibrary.h"
#include "support/ProviderLibrary.h"
#include "support/Values.h"

namespace {

using testsupport::named;
using testsupport::objectPath;
using testsupport::Outcome;
using testsupport::ProviderLibrary;
using testsupport::RecordingBroker;
using testsupport::stringOf;
using testsupport::text;

class ProviderLibraryTest : public testing::Test {
protected:
    static cimhost::ObjectPath thing(const char* name) {
        return objectPath("root/cimv2", "Sample_Thing", {named("Name", text(name))});
    }

    const cimhost::ObjectPath things = objectPath("root/cimv2", "Sample_Thing");
    RecordingBroker broker;
    ProviderLibrary provider{TEST_PROVIDERS "/libSampleProvider.so", "Sample", broker};
};

TEST_F(ProviderLibraryTest, LoadingCallsNoFunctionOfTheProvider) {
    EXPECT_TRUE(broker.calls().empty());
}

TEST_F(ProviderLibraryTest, CallsTheFactoryWithTheBroker) {
    CMPIStatus status{CMPI_RC_ERROR, nullptr};
    EXPECT_NE(provider.createInstanceMI(broker.handle(), &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERROR) << "this factory leaves it alone";
    EXPECT_EQ(broker.count("CMPIBrokerEncFT.logMessage"), 1);
    provider.enumerateInstances(things);
    EXPECT_EQ(broker.count("CMPIBrokerEncFT.logMessage"), 1) << "the factory is not called again";
}

TEST_F(ProviderLibraryTest, RunsEveryInstanceOperation) {
    EXPECT_EQ(provider.createInstance(thing("a"), testsupport::instance(thing("a"))).paths().size(), 1U);
    EXPECT_EQ(provider.enumerateInstances(things).instances().size(), 1U);
    EXPECT_EQ(provider.enumerateInstanceNames(things).paths().size(), 1U);
    const Outcome found = provider.getInstance(thing("a"));
    EXPECT_EQ(found.rc, CMPI_RC_OK);
    EXPECT_FALSE(found.hasMessage);
    EXPECT_EQ(found.doneCount, 1);
    EXPECT_EQ(stringOf(found.instances().front().properties, "Name"), "a");
    EXPECT_EQ(provider.modifyInstance(thing("a"), testsupport::instance(thing("a"))).rc, CMPI_RC_OK);
    EXPECT_EQ(provider.deleteInstance(thing("a")).rc, CMPI_RC_OK);
    EXPECT_EQ(provider.cleanupInstanceMI(true).rc, CMPI_RC_OK);
}

TEST_F(ProviderLibraryTest, RunsEveryAssociationOperation) {
    const cimhost::AssociationFilter filter{"Sample_Link", {}, {}, "Role"};
    EXPECT_EQ(stringOf(provider.associators(thing("a"), filter).instances().front().properties, "Asked"),
              "Sample_Link,none,none,Role");
    EXPECT_EQ(provider.associatorNames(thing("a"), filter).paths().size(), 1U);
    EXPECT_EQ(provider.references(thing("a"), {{}, "Sample_Link", {}, {}}).instances().size(), 1U);
    EXPECT_EQ(provider.referenceNames(thing("a"), {}).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(provider.cleanupAssociationMI(false).rc, CMPI_RC_OK);
}

TEST_F(ProviderLibraryTest, ReportsMessagesAndExceptions) {
    const Outcome failing = provider.enumerateInstances(objectPath("root/cimv2", "Sample_Failing"));
    EXPECT_EQ(failing.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_TRUE(failing.hasMessage);
    EXPECT_EQ(failing.message, "not for you");
    EXPECT_EQ(failing.events.size(), 1U);
    const Outcome throwing = provider.enumerateInstances(objectPath("root/cimv2", "Sample_Throwing"));
    EXPECT_TRUE(throwing.threw);
    EXPECT_THAT(throwing.message, testing::HasSubstr("out of paper"));
}

TEST_F(ProviderLibraryTest, ProviderReceivesInjectedFailures) {
    provider.createInstance(thing("a"), testsupport::instance(thing("a")));
    broker.failCall("CMPIResultFT.returnInstance", 1, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(provider.enumerateInstances(things).instances().empty());
    broker.answerNothingEver("CMPIStringFT.getCharPtr");
    EXPECT_TRUE(provider.getInstance(thing("a")).instances().empty()) << "the key has no characters";
}

TEST_F(ProviderLibraryTest, ProviderReceivesServedInstances) {
    broker.serve("Other_Thing", {testsupport::instance(objectPath("root/cimv2", "Other_Thing"))});
    const Outcome found = provider.enumerateInstances(objectPath("root/cimv2", "Sample_CallsOther_Thing"));
    ASSERT_EQ(found.instances().size(), 1U);
    EXPECT_EQ(found.instances().front().path.className, "Other_Thing");
}

TEST_F(ProviderLibraryTest, HasAContext) {
    const auto context = [&] {
        const Outcome found = provider.enumerateInstances(objectPath("root/cimv2", "Sample_Context"));
        return stringOf(found.instances().front().properties, "Name");
    };
    EXPECT_EQ(context(), ";tester;0");
    provider.setContext({named(CMPIInitNameSpace, text("root/x"))});
    EXPECT_EQ(context(), "root/x;;0");
}

TEST_F(ProviderLibraryTest, RunsAnyCall) {
    const Outcome outcome =
        provider.call([&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
            CMPIInstanceMI* mi = provider.instanceMI();
            return mi->ft->deleteInstance(mi, context, result, scope.objectPath(thing("missing")));
        });
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(ProviderLibraryTest, ReportsMissingLibrariesAndFactories) {
    EXPECT_THROW(ProviderLibrary("/nonexistent/libNone.so", "None", broker), cimhost::LibraryError);
    ProviderLibrary wrong(TEST_PROVIDERS "/libSampleProvider.so", "Wrong", broker);
    EXPECT_THROW(wrong.instanceMI(), cimhost::LibraryError);
    EXPECT_EQ(wrong.function<void()>("nothing"), nullptr);
}

}  // namespace
