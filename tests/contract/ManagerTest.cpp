#include <tuple>

#include "RecordFixture.h"

// Tests the provider with brokers and values like those of existing object managers.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using testsupport::Manager;
using testsupport::named;
using testsupport::text;
using testsupport::uint32;

/** Makes requests of each kind, and expects the same results with every broker. */
class ManagerTest : public RecordTest {
protected:
    void expectAllRequestsServed() {
        broker.serve("VELKO_ComputerSystem", {clientInstance(computerPath(), {})});
        createAll({"A", "B"});
        EXPECT_THAT(modify("A", {named(kind().textProperty, text("some text")), named(kind().numberProperty, uint32(5)),
                                 named(kind().dateProperty, testsupport::dateTime("20240506070809.123456+120"))}),
                    isOk(0));
        EXPECT_EQ(recordOf("A"),
                  kind().shownRecord("A", {std::string(kind().textProperty) + "=\"some text\"",
                                           std::string(kind().numberProperty) + "=5",
                                           std::string(kind().dateProperty) + "=\"20240506070809.123456+120\""}));
        EXPECT_THAT(remove("A"), isOk(0));
        EXPECT_THAT(identifiers(), ElementsAre("B"));
        EXPECT_EQ(data(), dataOfNew({"B"}));
        const std::string association = std::string(kind().className) + "Setting";
        EXPECT_THAT(provider().enumerateInstances(classPath(association)).instances(), SizeIs(1));
        EXPECT_THAT(provider().associators(computerPath(), {association, {}, {}, {}}), isOk(1));
        EXPECT_THAT(provider().getInstance(classPath("VELKO_OstrelAgent")).instances(), SizeIs(1));
        EXPECT_THAT(provider().getInstance(classPath("VELKO_AssetIDDetails")).instances(), SizeIs(1));
    }

    /** Returns the record "A" after a modification in which a property has these data. */
    std::vector<std::string> afterReading(const char* property, const CMPIData& data) {
        broker.answerData("CMPIInstanceFT.getProperty", property, data);
        EXPECT_THAT(modify("A", {}), isOk(0));
        broker.cancelFailures();
        return recordOf("A");
    }

    static CMPIData dataOf(CMPIType type, CMPIValueState state) {
        CMPIData data{};
        data.type = type;
        data.state = state;
        return data;
    }
};

TEST_P(ManagerTest, VersionZeroAndMissingFunctionsAreAccepted) {
    broker.emulate(Manager::sfcb);
    ASSERT_EQ(broker.handle()->bft->brokerVersion, 0);
    expectAllRequestsServed();
}

TEST_P(ManagerTest, AMissingMemoryTableIsAccepted) {
    broker.emulate(Manager::openPegasus);
    ASSERT_EQ(broker.handle()->mft, nullptr);
    expectAllRequestsServed();
}

TEST_P(ManagerTest, MemoryThreadReleaseAndCloneFunctionsOfTheBrokerAreNotUsed) {
    expectAllRequestsServed();
    for (const std::string& function : broker.functions()) {
        EXPECT_NE(function.substr(0, function.find('.')), "CMPIBrokerMemFT") << function;
        EXPECT_NE(function.substr(0, function.find('.')), "CMPIBrokerExtFT") << function;
        EXPECT_EQ(function.find(".release"), std::string::npos) << "objects belong to the broker: " << function;
        EXPECT_EQ(function.find(".clone"), std::string::npos) << function;
    }
}

TEST_P(ManagerTest, AStringInTheNullStateIsNotAValueWhateverItPointsTo) {
    createAll({"A"});
    modify("A", {named(kind().textProperty, text("kept"))});
    const auto kept = recordOf("A");
    for (CMPIString* string :
         {broker.stringWithoutCharacters(), broker.string("ghost"), static_cast<CMPIString*>(nullptr)}) {
        CMPIData data = dataOf(CMPI_string, CMPI_nullValue);
        data.value.string = string;
        EXPECT_EQ(afterReading(kind().textProperty, data), kept);
        EXPECT_EQ(afterReading(kind().dateProperty, data), kept);
    }
}

TEST_P(ManagerTest, AStringWithoutCharactersIsNotAValueEvenInTheGoodState) {
    createAll({"A"});
    modify("A", {named(kind().textProperty, text("kept"))});
    const auto kept = recordOf("A");
    for (CMPIString* string : {broker.stringWithoutCharacters(), static_cast<CMPIString*>(nullptr)}) {
        CMPIData data = dataOf(CMPI_string, CMPI_goodValue);
        data.value.string = string;
        EXPECT_EQ(afterReading(kind().textProperty, data), kept);
        EXPECT_EQ(afterReading(kind().dateProperty, data), kept);
        EXPECT_EQ(afterReading(kind().numberProperty, data), kept);
    }
}

TEST_P(ManagerTest, ADatetimeThatIsANullPointerIsNotAValue) {
    createAll({"A"});
    EXPECT_EQ(afterReading(kind().dateProperty, dataOf(CMPI_dateTime, CMPI_goodValue)), kind().shownRecord("A"));
}

TEST_P(ManagerTest, ANumberInTheStateNullNotFoundOrBadIsNotAValue) {
    createAll({"A"});
    for (const CMPIValueState state :
         {static_cast<CMPIValueState>(CMPI_nullValue), static_cast<CMPIValueState>(CMPI_notFound),
          static_cast<CMPIValueState>(CMPI_badValue)}) {
        CMPIData data = dataOf(CMPI_uint32, state);
        data.value.uint32 = 99;
        EXPECT_EQ(afterReading(kind().numberProperty, data), kind().shownRecord("A"));
    }
}

TEST_P(ManagerTest, AValueInTheKeyStateIsAValue) {
    createAll({"A"});
    CMPIData data = dataOf(CMPI_uint32, CMPI_keyValue);
    data.value.uint32 = 99;
    EXPECT_EQ(afterReading(kind().numberProperty, data),
              kind().shownRecord("A", {std::string(kind().numberProperty) + "=99"}));
}

TEST_P(ManagerTest, AKeyThatIsCountedButCannotBeReadCreatesNothing) {
    CMPIData unusable = dataOf(CMPI_string, CMPI_nullValue);
    for (CMPIString* string : {static_cast<CMPIString*>(nullptr), broker.string("")}) {
        unusable.value.string = string;
        broker.answerData("CMPIObjectPathFT.getKey", "InstanceID", unusable, CMPI_RC_ERR_NOT_FOUND);
        const Outcome outcome = create("A");
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_THAT(outcome.instances(), IsEmpty());
    }
    broker.cancelFailures();
    EXPECT_THAT(identifiers(), IsEmpty());
}

TEST_P(ManagerTest, AKeyWithoutCharactersIsIgnoredSoDeletionFails) {
    createAll({"A", "B"});
    CMPIData key = dataOf(CMPI_string, CMPI_keyValue);
    for (CMPIString* string : {static_cast<CMPIString*>(nullptr), broker.stringWithoutCharacters()}) {
        key.value.string = string;
        broker.answerData("CMPIObjectPathFT.getKey", "InstanceID", key);
        EXPECT_THAT(identifiersOf(get("B").instances()), ElementsAre("A", "B"));
        EXPECT_THAT(remove("B"), isOk(0));
        broker.cancelFailures();
    }
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
}

TEST_P(ManagerTest, AnEmptyAndANullNamespaceAreAccepted) {
    createAll({"A"});
    ObjectPath nowhere = allPath();
    nowhere.nameSpace.clear();
    const auto paths = provider().enumerateInstanceNames(nowhere).paths();
    ASSERT_THAT(paths, SizeIs(1));
    EXPECT_EQ(paths.front().nameSpace, "");
    broker.answerNothingEver("CMPIObjectPathFT.getNameSpace");
    EXPECT_THAT(identifiers(), ElementsAre("A"));
}

TEST_P(ManagerTest, ANullContextIsAccepted) {
    createAll({"A"});
    CMPIInstanceMI* interface = provider().instanceMI();
    const Outcome outcome = provider().call([&](auto& scope, const CMPIContext*, const CMPIResult* result) {
        return interface->ft->enumerateInstances(interface, nullptr, result, scope.objectPath(allPath()), nullptr);
    });
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.instances(), SizeIs(1));
}

INSTANTIATE_RECORD_TEST(ManagerTest);

}  // namespace
}  // namespace contract
