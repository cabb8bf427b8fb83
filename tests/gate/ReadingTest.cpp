#include "GateFixture.h"
#include "support/Files.h"

// Tests reads of leases, the agent and asset data, and changes to asset data.

namespace gatetest {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;
using testing::UnorderedElementsAre;
using testsupport::dateTime;
using testsupport::namesOf;

using ReadingTest = GateTest;

TEST_F(ReadingTest, KeysAreReturnedEvenIfThePropertyListOmitsThem) {
    create("L1", {named("Lessor", text("ACME")), named("LeaseTerm", uint32(12))});
    const cimhost::PropertyList list{{"lessor", "RenewalOption", "NoSuchProperty"}};
    const auto expected = UnorderedElementsAre("InstanceID", "Lessor", "RenewalOption");
    const Outcome one = gate().getInstance(keyedPath(lease, "L1"), list);
    ASSERT_THAT(one, isAnswered(1));
    EXPECT_THAT(namesOf(one.instances().front().properties), expected);
    EXPECT_EQ(valueIn(one.instances().front(), "Lessor"), "ACME");
    EXPECT_EQ(testsupport::toText(one.instances().front().path), "root/cimv2:VELKO_Lease.InstanceID=\"L1\"");
    const Outcome all = gate().enumerateInstances(classPath(lease), list);
    ASSERT_THAT(all, isAnswered(1));
    EXPECT_THAT(namesOf(all.instances().front().properties), expected);
    const Outcome keys = gate().enumerateInstances(classPath(lease), cimhost::PropertyList(std::vector<std::string>{}));
    ASSERT_THAT(keys, isAnswered(1));
    EXPECT_THAT(namesOf(keys.instances().front().properties), ElementsAre("InstanceID"));
}

TEST_F(ReadingTest, ThePropertyFilterContainsTheKeys) {
    create("L1");
    broker.forget();
    gate().getInstance(keyedPath(lease, "L1"), {{"Lessor"}});
    const auto filters = broker.calls("CMPIInstanceFT.setPropertyFilter");
    ASSERT_FALSE(filters.empty());
    EXPECT_THAT(filters.back().arguments, ElementsAre("{InstanceID,Lessor}", "{InstanceID}"));
}

TEST_F(ReadingTest, AListOfAllPropertiesHasTheEffectOfNoList) {
    create("L1", {named("Lessor", text("ACME"))});
    const Instance whole = instanceOf("L1");
    std::vector<std::string> everything{"Caption", "Description", "ConfigurationName", "ChangeableType",
                                        "BaseTermCommencementDate"};
    for (const std::string& name : namesOf(whole.properties)) {
        everything.push_back(name);
    }
    const Outcome listed = gate().getInstance(keyedPath(lease, "L1"), everything);
    ASSERT_THAT(listed, isAnswered(1));
    EXPECT_EQ(namesOf(listed.instances().front().properties), namesOf(whole.properties));
}

TEST_F(ReadingTest, ListedPropertiesWithoutAValueAreReturnedAsNull) {
    create("L1");
    const Outcome outcome = gate().getInstance(keyedPath(lease, "L1"), {{"BaseTermCommencementDate"}});
    ASSERT_THAT(outcome, isAnswered(1));
    EXPECT_TRUE(testsupport::isNull(outcome.instances().front().properties, "BaseTermCommencementDate"));
}

TEST_F(ReadingTest, TheAgentIsFoundOnlyIfAllKeysMatch) {
    const Outcome names = gate().enumerateInstanceNames(classPath(agent));
    ASSERT_THAT(names, isAnswered(1));
    ObjectPath path = names.paths().front();
    EXPECT_THAT(gate().getInstance(path), isAnswered(1));
    path.keys.front() = named(path.keys.front().name, text("other"));
    EXPECT_THAT(gate().getInstance(path), isRefused(CMPI_RC_ERR_NOT_FOUND, agent));
    path.keys.pop_back();
    EXPECT_THAT(gate().getInstance(path), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "key"));
}

class AssetTest : public GateTest {
protected:
    ObjectPath path() { return gate().enumerateInstanceNames(classPath(asset)).paths().front(); }

    Outcome change(std::vector<NamedValue> properties) {
        return gate().modifyInstance(path(), testsupport::instance(path(), std::move(properties)));
    }

    Instance current() {
        const Outcome outcome = gate().getInstance(path());
        EXPECT_THAT(outcome, isAnswered(1));
        return outcome.instances().empty() ? Instance{} : outcome.instances().front();
    }
};

TEST_F(AssetTest, AChangeLeavesOtherPropertiesUnchanged) {
    EXPECT_THAT(change({named("PersonalizedLabel1", text("Room")), named("PersonalizedData1", text("12")),
                        named("PersonalizedLabel2", text("Floor")), named("PersonalizedData2", text("3")),
                        named("PrimaryOwnerName", text("Jo Example"))}),
                isDone());
    const Instance before = current();
    EXPECT_EQ(valueIn(before, "PersonalizedLabel3"), "Null")
        << "a missing label does not take the value of the preceding label";
    EXPECT_THAT(change({named("PersonalizedData2", text("4")), named("PrimaryOwnerPhone", text("+49 1"))}), isDone());
    const Instance after = current();
    for (const std::string& name : namesOf(after.properties)) {
        if (name == "PersonalizedData2") {
            EXPECT_EQ(valueIn(after, name), "4");
        } else if (name == "PrimaryOwnerPhone") {
            EXPECT_EQ(valueIn(after, name), "+49 1");
        } else if (name != "LocalDateTime") {
            EXPECT_EQ(valueIn(after, name), valueIn(before, name)) << name;
        }
    }
}

TEST_F(AssetTest, AReadInstanceWithOneChangedValueIsAccepted) {
    change({named("ZOPMProfile", text("Office")), named("AssetNumber", text("A_1 _ 2"))});
    Instance sent = current();
    for (NamedValue& property : sent.properties) {
        // The instance is sent back some time after it was read.
        property =
            property.name == "LocalDateTime" ? named("LocalDateTime", dateTime("20200101120000.000000+000")) : property;
        property = property.name == "ZOPMProfile" ? named("ZOPMProfile", text("Factory")) : property;
    }
    EXPECT_THAT(gate().modifyInstance(path(), sent), isDone());
    EXPECT_EQ(valueIn(current(), "ZOPMProfile"), "Factory");
    EXPECT_EQ(valueIn(current(), "DeploymentProfile"), "Factory");
}

TEST_F(AssetTest, APathThatLacksKeysIsRefusedAndChangesNothing) {
    ObjectPath keyless = path();
    const Instance sent = testsupport::instance(keyless, {named("AssetNumber", text("A1"))});
    while (!keyless.keys.empty()) {
        keyless.keys.pop_back();
        EXPECT_THAT(gate().modifyInstance(keyless, sent), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "key"));
    }
    EXPECT_EQ(valueIn(current(), "AssetNumber"), "");
}

TEST_F(AssetTest, AChangeWritesNoPersonalizedValueThatWasNotSent) {
    EXPECT_THAT(change({named("AssetNumber", text("A1"))}), isDone());
    const std::string untouched = testsupport::readFile(dataFile("asset.dat"));
    EXPECT_THAT(untouched, testing::HasSubstr("USER.AssetNumber=A1\n"));
    EXPECT_THAT(untouched, Not(testing::HasSubstr("Null")));
    EXPECT_THAT(change({named("PersonalizedLabel2", text("Room")), named("PersonalizedData4", text(""))}), isDone());
    EXPECT_THAT(testsupport::readFile(dataFile("asset.dat")), Not(testing::HasSubstr("Null")));
    EXPECT_THAT(gate().modifyInstance(path(), current()), isDone()) << "unchanged";
    EXPECT_THAT(testsupport::readFile(dataFile("asset.dat")), Not(testing::HasSubstr("Null")));
    EXPECT_EQ(valueIn(current(), "PersonalizedLabel2"), "Room");
    EXPECT_EQ(valueIn(current(), "PersonalizedLabel3"), "Null");
}

TEST_F(AssetTest, ATrimmedReadOnlyStringIsAccepted) {
    testsupport::writeFile(dataFile("asset.dat"), "USER.AssetIdTag=TAG-7 \xc3\xa9\nUSER.AssetNumber=A1 \n");
    const Instance before = current();
    for (const char* tag : {"TAG-7", "TAG-7 \xc3\xa9"}) {
        EXPECT_THAT(change({named("AssetIdTag", text(tag)), named("AssetNumber", text("A1")),
                            named("PrimaryOwnerName", text("Jo"))}),
                    isDone());
    }
    EXPECT_EQ(valueIn(current(), "AssetIdTag"), valueIn(before, "AssetIdTag"));
    EXPECT_EQ(valueIn(current(), "AssetNumber"), valueIn(before, "AssetNumber"));
    EXPECT_THAT(change({named("AssetIdTag", text("TAG"))}), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "AssetIdTag"));
}

TEST_F(AssetTest, ZerosUnsetADate) {
    EXPECT_THAT(change({named("PurchaseDate", dateTime("20240229235959.123456-480"))}), isDone());
    EXPECT_THAT(change({named("PurchaseDate", dateTime("00000000000000.000000+000"))}), isDone());
    EXPECT_EQ(valueIn(current(), "PurchaseDate"), std::nullopt);
    EXPECT_THAT(change({named("PurchaseDate", dateTime("00000000000000.000000-000"))}), isDone());
}

TEST_F(AssetTest, ReadOnlyPropertiesAreRefusedAndNamed) {
    const std::vector<NamedValue> readOnly{named("AssetIdTag", text("x")), named("DeploymentProfile", text("x")),
                                           named("Vendor", text("x")), named("AssetIDStringArea", uint32(1))};
    for (const NamedValue& property : readOnly) {
        EXPECT_THAT(change({named("AssetNumber", text("A1")), property}),
                    isRefused(CMPI_RC_ERR_INVALID_PARAMETER, property.name));
    }
    EXPECT_EQ(valueIn(current(), "AssetNumber"), "");
}

TEST_F(AssetTest, StringsAreStoredExactlyAndCanBeEmptied) {
    const std::string odd = " a_b\n* ";
    EXPECT_THAT(change({named("AssetNumber", text(odd)), named("PersonalizedData1", text("x"))}), isDone());
    unload();
    EXPECT_EQ(valueIn(current(), "AssetNumber"), odd);
    EXPECT_THAT(change({named("AssetNumber", text("")), named("PersonalizedData1", text(""))}), isDone());
    EXPECT_EQ(valueIn(current(), "AssetNumber"), "");
    EXPECT_EQ(valueIn(current(), "PersonalizedData1"), "Null");
}

TEST_F(AssetTest, OnlyValidDatesAreAccepted) {
    EXPECT_THAT(change({named("PurchaseDate", dateTime("20260229000000.000000+000"))}),
                isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "PurchaseDate"));
    EXPECT_THAT(change({named("PurchaseDate", dateTime("00000001000000.000000:000"))}),
                isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "PurchaseDate"));
    EXPECT_THAT(change({named("PurchaseDate", dateTime("20240229235959.123456-480"))}), isDone());
    EXPECT_EQ(valueIn(current(), "PurchaseDate"), "20240229235959.123456-480");
}

TEST_F(AssetTest, APathOfAnotherComputerIsNotFound) {
    ObjectPath other = path();
    for (NamedValue& key : other.keys) {
        key = key.name == "Name" ? named("Name", text("gamma")) : key;
    }
    EXPECT_THAT(gate().modifyInstance(other, testsupport::instance(other, {named("AssetNumber", text("A1"))})),
                isRefused(CMPI_RC_ERR_NOT_FOUND, asset));
    EXPECT_THAT(gate().getInstance(other), isRefused(CMPI_RC_ERR_NOT_FOUND, asset));
    EXPECT_EQ(valueIn(current(), "AssetNumber"), "");
}

}  // namespace
}  // namespace gatetest
