#include <gtest/gtest.h>

#include <string>

#include "compat/Recorder.h"
#include "compat/SmallProviders.h"

namespace {

constexpr CMPIContext* noContext = nullptr;
constexpr CMPIResult* noResult = nullptr;
constexpr CMPIObjectPath* noPath = nullptr;

TEST(Stub, SetsVersionAndNameOfEveryInterface) {
    const CMPIBroker broker{};
    const auto expectHead = [](const auto* mi, const char* name) {
        EXPECT_EQ(mi->ft->ftVersion, CMPIVersion200);
        EXPECT_EQ(mi->ft->miVersion, CMPIVersion200);
        EXPECT_STREQ(mi->ft->miName, name);
    };
    expectHead(Small_Create_InstanceMI(&broker, nullptr, nullptr), "instanceSmall");
    expectHead(Small_Create_AssociationMI(&broker, nullptr, nullptr), "associationSmall");
    expectHead(Small_Create_MethodMI(&broker, nullptr, nullptr), "methodSmall");
    expectHead(Small_Create_PropertyMI(&broker, nullptr, nullptr), "propertySmall");
    expectHead(Small_Create_IndicationMI(&broker, nullptr, nullptr), "indicationSmall");
    expectHead(Smaller_Create_InstanceMI(&broker, nullptr, nullptr), "instanceSmaller");
}

TEST(Stub, ReturnsTheSameInterfaceInEveryCallAndKeepsTheLatestBroker) {
    const CMPIBroker first{};
    const CMPIBroker second{};
    CMPIInstanceMI* const mi = Small_Create_InstanceMI(&first, nullptr, nullptr);
    EXPECT_EQ(smallProvidersBroker(), &first);
    EXPECT_EQ(Small_Create_InstanceMI(&second, nullptr, nullptr), mi);
    EXPECT_EQ(smallProvidersBroker(), &second);
    EXPECT_NE(Smaller_Create_InstanceMI(&first, nullptr, nullptr), mi) << "a separate interface";
}

TEST(Stub, RunsTheHookWithTheArgumentsOfTheFactory) {
    const CMPIBroker broker{};
    const CMPIContext context{};
    const int before = smallerHookRuns();
    CMPIStatus status{};
    EXPECT_NE(Smaller_Create_InstanceMI(&broker, &context, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_NE(Smaller_Create_InstanceMI(&broker, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(smallerHookRuns(), before + 2);
}

TEST(Stub, AssignsTheInstanceFunctions) {
    const CMPIBroker broker{};
    CMPIInstanceMI* const mi = Small_Create_InstanceMI(&broker, nullptr, nullptr);
    const CMPIInstanceMIFT& table = *mi->ft;
    EXPECT_EQ(table.cleanup(mi, noContext, 0).rc, CMPI_RC_DO_NOT_UNLOAD);
    EXPECT_EQ(table.cleanup(mi, noContext, 1).rc, CMPI_RC_OK);
    EXPECT_EQ(table.enumerateInstances(mi, noContext, noResult, noPath, nullptr).rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(table.createInstance(mi, noContext, noResult, noPath, nullptr).rc, CMPI_RC_ERR_ALREADY_EXISTS);
    EXPECT_EQ(table.modifyInstance(mi, noContext, noResult, noPath, nullptr, nullptr).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(table.deleteInstance(mi, noContext, noResult, noPath).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(table.execQuery(mi, noContext, noResult, noPath, "", "").rc, CMPI_RC_ERR_INVALID_QUERY);
}

TEST(Stub, AssignsTheAssociationFunctions) {
    const CMPIBroker broker{};
    CMPIAssociationMI* const mi = Small_Create_AssociationMI(&broker, nullptr, nullptr);
    const CMPIAssociationMIFT& table = *mi->ft;
    EXPECT_EQ(table.cleanup(mi, noContext, 0).rc, CMPI_RC_NEVER_UNLOAD);
    EXPECT_EQ(table.associators(mi, noContext, noResult, noPath, "", "", "", "", nullptr).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(table.associatorNames(mi, noContext, noResult, noPath, "", "", "", "").rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(table.references(mi, noContext, noResult, noPath, "", "", nullptr).rc, CMPI_RC_ERR_INVALID_NAMESPACE);
    EXPECT_EQ(table.referenceNames(mi, noContext, noResult, noPath, "", "").rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST(Stub, AssignsTheMethodAndPropertyFunctions) {
    const CMPIBroker broker{};
    CMPIMethodMI* const methods = Small_Create_MethodMI(&broker, nullptr, nullptr);
    EXPECT_EQ(methods->ft->cleanup(methods, noContext, 0).rc, CMPI_RC_OK);
    EXPECT_EQ(methods->ft->invokeMethod(methods, noContext, noResult, noPath, "", nullptr, nullptr).rc,
              CMPI_RC_ERR_METHOD_NOT_FOUND);

    CMPIPropertyMI* const properties = Small_Create_PropertyMI(&broker, nullptr, nullptr);
    EXPECT_EQ(properties->ft->cleanup(properties, noContext, 0).rc, CMPI_RC_OK);
    EXPECT_EQ(properties->ft->setProperty(properties, noContext, noResult, noPath, "", {}).rc,
              CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(properties->ft->getProperty(properties, noContext, noResult, noPath, "").rc,
              CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(properties->ft->setPropertyWithOrigin, nullptr);
}

TEST(Stub, AssignsTheIndicationFunctions) {
    const CMPIBroker broker{};
    CMPIIndicationMI* const mi = Small_Create_IndicationMI(&broker, nullptr, nullptr);
    const CMPIIndicationMIFT& table = *mi->ft;
    EXPECT_EQ(table.cleanup(mi, noContext, 0).rc, CMPI_RC_OK);
    EXPECT_EQ(table.authorizeFilter(mi, noContext, nullptr, "", noPath, "").rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(table.mustPoll(mi, noContext, nullptr, "", noPath).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(table.activateFilter(mi, noContext, nullptr, "", noPath, 1).rc, CMPI_RC_ERR_INVALID_QUERY);
    EXPECT_EQ(table.deActivateFilter(mi, noContext, nullptr, "", noPath, 1).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(table.enableIndications(mi, noContext).rc, CMPI_RC_OK);
    EXPECT_EQ(table.disableIndications(mi, noContext).rc, CMPI_RC_ERR_FAILED);
}

// The calls that a provider makes during a request, and the objects that it receives.
struct Observed {
    bool keyIsThere = true;
    std::string log;
    CMPIInstanceFT instanceTable{};
    CMPIInstance instance{this, &instanceTable};
    CMPIString message{this, nullptr};
} observed;

CMPIData keyOf(const CMPIObjectPath*, const char* name, CMPIStatus* rc) {
    observed.log += std::string("key ") + name + "\n";
    rc->rc = observed.keyIsThere ? CMPI_RC_OK : CMPI_RC_ERR_NOT_FOUND;
    return {};
}

CMPIString* makeString(const CMPIBroker*, const char* text, CMPIStatus*) {
    observed.log += std::string("string ") + text + "\n";
    return &observed.message;
}

CMPIInstance* makeInstance(const CMPIBroker*, const CMPIObjectPath*, CMPIStatus*) {
    observed.log += "instance\n";
    return &observed.instance;
}

CMPIStatus setProperty(const CMPIInstance*, const char* name, const CMPIValue* value, CMPIType type) {
    EXPECT_EQ(type, CMPI_chars);
    observed.log += std::string(name) + "=" + reinterpret_cast<const char*>(value) + "\n";
    return {};
}

CMPIStatus returnInstance(const CMPIResult*, const CMPIInstance* instance) {
    observed.log += instance == &observed.instance ? "returned\n" : "returned another\n";
    return {};
}

CMPIStatus returnPath(const CMPIResult*, const CMPIObjectPath*) {
    observed.log += "path\n";
    return {};
}

CMPIStatus returnDone(const CMPIResult*) {
    observed.log += "done\n";
    return {};
}

class ProviderInC : public testing::Test {
protected:
    ProviderInC() {
        observed.log.clear();
        observed.keyIsThere = true;
        observed.instanceTable.setProperty = setProperty;
        makers.newString = makeString;
        makers.newInstance = makeInstance;
        pathTable.getKey = keyOf;
        resultTable.returnInstance = returnInstance;
        resultTable.returnObjectPath = returnPath;
        resultTable.returnDone = returnDone;
    }

    CMPIBrokerEncFT makers{};
    const CMPIBroker broker{nullptr, nullptr, &makers, nullptr, nullptr};
    CMPIObjectPathFT pathTable{};
    const CMPIObjectPath path{nullptr, &pathTable};
    CMPIResultFT resultTable{};
    const CMPIResult result{nullptr, &resultTable};
    CMPIInstanceMI* mi = Small_Create_InstanceMI(&broker, nullptr, nullptr);
};

TEST_F(ProviderInC, ReturnsAnInstanceThroughTheTables) {
    EXPECT_EQ(mi->ft->getInstance(mi, noContext, &result, &path, nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(observed.log, "key Id\ninstance\nName=small\nreturned\ndone\n");
}

TEST_F(ProviderInC, ReturnsAMessageIfThereIsNoInstance) {
    observed.keyIsThere = false;
    const CMPIStatus status = mi->ft->getInstance(mi, noContext, &result, &path, nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(status.msg, &observed.message);
    EXPECT_EQ(observed.log, "key Id\nstring no such thing\n");
}

TEST_F(ProviderInC, ReturnsAPathThroughTheTables) {
    EXPECT_EQ(mi->ft->enumerateInstanceNames(mi, noContext, &result, &path).rc, CMPI_RC_OK);
    EXPECT_EQ(observed.log, "path\ndone\n");
}

}  // namespace
