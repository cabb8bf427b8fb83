#include <limits>

#include "RecordFixture.h"

// Modification of records.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::boolean;
using testsupport::dateTime;
using testsupport::named;
using testsupport::nullOf;
using testsupport::sint32;
using testsupport::text;
using testsupport::uint32;

constexpr const char* date = "20240506070809.123456+120";

class ModifyTest : public RecordTest {
protected:
    /** Return the string, number or date property of a record in the format of shown(). */
    std::string shownText(const std::string& value) const {
        return std::string(kind().textProperty) + "=\"" + value + '"';
    }
    std::string shownNumber(unsigned int value) const {
        return std::string(kind().numberProperty) + "=" + std::to_string(value);
    }
    std::string shownDate(const std::string& value) const {
        return std::string(kind().dateProperty) + "=\"" + value + '"';
    }

    /** Sets one property of the record "A" and returns the record. */
    std::vector<std::string> after(const char* property, const cimhost::Value& value) {
        const Outcome outcome = modify("A", {named(property, value)});
        EXPECT_THAT(outcome, isOk(0));
        EXPECT_THAT(outcome.events, IsEmpty());
        return recordOf("A");
    }

    /** Expects that an action does not rewrite the file. */
    template <class Action>
    void expectNoRewrite(Action action) {
        writeData(kind().dataFile, "mark");
        action();
        EXPECT_EQ(data(), "mark");
    }
};

TEST_P(ModifyTest, ReturnsNothingAndDoesNotCallReturnDone) {
    createAll({"A"});
    const Outcome outcome = modify("A", {named(kind().textProperty, text("changed"))});
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A", {shownText("changed")}));
}

TEST_P(ModifyTest, ChangesOnlyTheRecordWithTheKey) {
    createAll({"A", "B", "C"});
    modify("B", {named(kind().numberProperty, uint32(12))});
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A"));
    EXPECT_EQ(recordOf("B"), kind().shownRecord("B", {shownNumber(12)}));
    EXPECT_EQ(recordOf("C"), kind().shownRecord("C"));
}

TEST_P(ModifyTest, PropertiesThatAreAbsentKeepTheirValues) {
    createAll({"A"});
    after(kind().textProperty, text("first"));
    after(kind().numberProperty, uint32(3));
    EXPECT_EQ(after(kind().dateProperty, dateTime(date)),
              kind().shownRecord("A", {shownText("first"), shownNumber(3), shownDate(date)}));
}

TEST_P(ModifyTest, NullsChangeNothing) {
    createAll({"A"});
    after(kind().textProperty, text("kept"));
    after(kind().numberProperty, uint32(3));
    const auto before = recordOf("A");
    expectNoRewrite([&] {
        modify("A", {named(kind().textProperty, nullOf(CMPI_string)), named(kind().numberProperty, nullOf(CMPI_uint32)),
                     named(kind().dateProperty, nullOf(CMPI_dateTime))});
    });
    EXPECT_EQ(recordOf("A"), before);
}

TEST_P(ModifyTest, AnEmptyStringIsAValue) {
    createAll({"A"});
    after(kind().textProperty, text("text"));
    EXPECT_EQ(after(kind().textProperty, text("")), kind().shownRecord("A"));
}

TEST_P(ModifyTest, ValuesOfAnotherTypeChangeNothing) {
    createAll({"A"});
    expectNoRewrite([&] {
        EXPECT_EQ(after(kind().textProperty, uint32(5)), kind().shownRecord("A"));
        EXPECT_EQ(after(kind().textProperty, boolean(true)), kind().shownRecord("A"));
        EXPECT_EQ(after(kind().numberProperty, text("5")), kind().shownRecord("A"));
        EXPECT_EQ(after(kind().numberProperty, boolean(true)), kind().shownRecord("A"));
        EXPECT_EQ(after(kind().numberProperty, testsupport::real64(5)), kind().shownRecord("A"));
        EXPECT_EQ(after(kind().dateProperty, uint32(5)), kind().shownRecord("A"));
    });
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(ModifyTest, NumbersOfAnyIntegerTypeAreAcceptedIfTheyAreInRange) {
    createAll({"A"});
    const auto withNumber = [&](unsigned int number) { return kind().shownRecord("A", {shownNumber(number)}); };
    constexpr std::uint64_t largest = std::numeric_limits<std::uint32_t>::max();
    EXPECT_EQ(after(kind().numberProperty, testsupport::uint8(8)), withNumber(8));
    EXPECT_EQ(after(kind().numberProperty, testsupport::uint16(16)), withNumber(16));
    EXPECT_EQ(after(kind().numberProperty, testsupport::uint64(64)), withNumber(64));
    EXPECT_EQ(after(kind().numberProperty, sint32(32)), withNumber(32));
    EXPECT_EQ(after(kind().numberProperty, testsupport::uint64(largest)), withNumber(4294967295U));
    EXPECT_EQ(after(kind().numberProperty, uint32(0)), withNumber(0));
    EXPECT_EQ(after(kind().numberProperty, testsupport::uint64(largest + 1)), withNumber(0));
    EXPECT_EQ(after(kind().numberProperty, sint32(-1)), withNumber(0));
}

TEST_P(ModifyTest, DatesAreAcceptedAsDatetimeAndAsString) {
    createAll({"A"});
    EXPECT_EQ(after(kind().dateProperty, dateTime(date)), kind().shownRecord("A", {shownDate(date)}));
    EXPECT_EQ(after(kind().dateProperty, text("20231231235959.000000-300")),
              kind().shownRecord("A", {shownDate("20231231235959.000000-300")}));
}

TEST_P(ModifyTest, AnInvalidDateIsReturnedAsNull) {
    createAll({"A"});
    for (const char* none : {"", "yesterday", "00000000000000.000000-000", "20240506070809.123456+1200"}) {
        EXPECT_EQ(after(kind().dateProperty, text(none)), kind().shownRecord("A")) << none;
    }
}

TEST_P(ModifyTest, ReadOnlyPropertiesAreIgnored) {
    createAll({"A"});
    expectNoRewrite([&] {
        modify("A", {named("InstanceID", text("Z")), named("ElementName", text("Z")), named("Caption", text("Z")),
                     named("Description", text("Z")), named("ConfigurationName", text("Z")),
                     named("ChangeableType", testsupport::uint16(1)), named("NoSuchProperty", text("Z"))});
    });
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A"));
}

TEST_P(ModifyTest, WritablePropertiesAreSetEvenIfReadOnlyPropertiesAreSent) {
    createAll({"A"});
    modify("A",
           {named("Caption", text("Z")), named(kind().numberProperty, uint32(24)), named("InstanceID", text("Z"))});
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A", {shownNumber(24)}));
}

TEST_P(ModifyTest, PropertyListsAreNotApplied) {
    createAll({"A"});
    const Instance sent =
        clientInstance(path("A"), {named(kind().textProperty, text("new")), named(kind().numberProperty, uint32(7))});
    EXPECT_THAT(provider().modifyInstance(path("A"), sent, cimhost::PropertyList({kind().numberProperty})), isOk(0));
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A", {shownText("new"), shownNumber(7)}));
    EXPECT_THAT(
        provider().modifyInstance(path("A"), clientInstance(path("A"), {named(kind().numberProperty, uint32(8))}),
                                  cimhost::PropertyList(std::vector<std::string>{})),
        isOk(0));
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A", {shownText("new"), shownNumber(8)}));
}

TEST_P(ModifyTest, ThePathInsideTheInstanceDoesNotSelectTheRecord) {
    createAll({"A", "B"});
    provider().modifyInstance(path("A"), clientInstance(path("B"), {named(kind().numberProperty, uint32(7))}));
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A", {shownNumber(7)}));
    EXPECT_EQ(recordOf("B"), kind().shownRecord("B"));
}

TEST_P(ModifyTest, WithoutAKeyTheFirstRecordIsChanged) {
    createAll({"A", "B"});
    const ObjectPath otherKey = testsupport::objectPath(nameSpace, kind().className, {named("Name", text("B"))});
    unsigned int number = 0;
    for (const ObjectPath& keyless : {allPath(), otherKey}) {
        ++number;
        EXPECT_THAT(
            provider().modifyInstance(keyless, clientInstance(keyless, {named(kind().numberProperty, uint32(number))})),
            isOk(0));
        EXPECT_EQ(recordOf("A"), kind().shownRecord("A", {shownNumber(number)}));
        EXPECT_EQ(recordOf("B"), kind().shownRecord("B"));
    }
}

TEST_P(ModifyTest, AnUnknownRecordIsOnlyLogged) {
    createAll({"A"});
    expectNoRewrite([&] { EXPECT_THAT(modify("B", {named(kind().textProperty, text("x"))}), isOk(0)); });
    EXPECT_THAT(caughtFailures(), ElementsAre(kind().notAvailable));
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A"));
}

TEST_P(ModifyTest, AnUnknownRecordIsNotLoggedIfNothingIsSet) {
    createAll({"A"});
    EXPECT_THAT(modify("B", {named("Caption", text("x"))}), isOk(0));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(ModifyTest, AModificationOfAnEmptyTableIsOnlyLogged) {
    const Instance sent = clientInstance(allPath(), {named(kind().textProperty, text("x"))});
    EXPECT_THAT(provider().modifyInstance(allPath(), sent), isOk(0));
    EXPECT_THAT(caughtFailures(), ElementsAre(kind().notAvailable));
    EXPECT_EQ(data(), std::nullopt);
}

TEST_P(ModifyTest, ANullInstanceChangesNothing) {
    createAll({"A"});
    CMPIInstanceMI* interface = provider().instanceMI();
    expectNoRewrite([&] {
        const Outcome outcome = provider().call([&](auto& scope, const CMPIContext* context, const CMPIResult* result) {
            return interface->ft->modifyInstance(interface, context, result, scope.objectPath(path("A")), nullptr,
                                                 nullptr);
        });
        EXPECT_THAT(outcome, isOk(0));
        EXPECT_THAT(outcome.events, IsEmpty());
    });
}

TEST_P(ModifyTest, SettingTheSameValueRewritesTheFile) {
    createAll({"A"});
    freeData(kind().dataFile);
    after(kind().numberProperty, uint32(0));
    EXPECT_EQ(data(), dataOfNew({"A"}));
}

INSTANTIATE_RECORD_TEST(ModifyTest);

TEST_F(ProviderTest, EveryModifiablePropertyOfALeaseIsWritten) {
    const ObjectPath path = keyedPath("VELKO_Lease", "A");
    provider().createInstance(path, clientInstance(path, {}));
    const std::vector<NamedValue> values{
        named("Lessor", text("ACME Leasing Co")),
        named("BaseTermCommencementDate", dateTime(date)),
        named("LeaseTerm", uint32(36)),
        named("EarlyTerminationOption", boolean(true)),
        named("FixedPricePurchaseOption", boolean(false)),
        named("RenewalOption", boolean(true)),
        named("BargainRenewalOption", boolean(true)),
        named("BaseRent", text("1,000.00 EUR")),
        named("FairMarketRental", text("900 EUR")),
        named("FairMarketValue", text("20000")),
        named("TerminationValue", text("*")),
        named("NetMonthlyLeaseRateFactor", uint32(4294967295U)),
    };
    EXPECT_THAT(provider().modifyInstance(path, clientInstance(path, values)), isOk(0));
    EXPECT_EQ(readData("Lease.dat"),
              "1\nA\nACME_Leasing_Co\n20240506070809.123456+120\n36\n1\n0\n1\n1\n1,000.00_EUR\n"
              "900_EUR\n20000\n*\n4294967295\n");
    std::vector<std::string> expected = shown(values);
    expected.insert(expected.begin(), {"InstanceID=\"A\"", "ElementName=\"Lease Information\""});
    EXPECT_EQ(shown(provider().getInstance(path).instances().at(0).properties), expected);
}

TEST_F(ProviderTest, AModificationThatAlsoSendsACaptionStoresAWarrantysDateAndDuration) {
    const ObjectPath path = keyedPath("VELKO_Warranty", "W");
    provider().createInstance(path, clientInstance(path, {}));
    EXPECT_THAT(provider().modifyInstance(
                    path, clientInstance(path, {named("WarrantyStartDate", dateTime(date)),
                                                named("WarrantyDuration", uint32(24)), named("Caption", text("new"))})),
                isOk(0));
    EXPECT_EQ(readData("Warranty.dat"), "1\nW\n*\n20240506070809.123456+120\n24\n");
    for (const bool isLoadedAgain : {false, true}) {
        if (isLoadedAgain) {
            unload();
        }
        EXPECT_THAT(
            shown(provider().getInstance(path).instances().at(0).properties),
            ElementsAre("InstanceID=\"W\"", "ElementName=\"Warranty Information\"",
                        std::string("WarrantyStartDate=\"") + date + '"', "WarrantyDuration=24", "Warrantor=\"\""));
    }
}

TEST_F(ProviderTest, EveryModifiablePropertyOfAWarrantyIsWritten) {
    const ObjectPath path = keyedPath("VELKO_Warranty", "W 1");
    provider().createInstance(path, clientInstance(path, {}));
    const std::vector<NamedValue> values{named("WarrantyStartDate", dateTime(date)),
                                         named("WarrantyDuration", uint32(24)),
                                         named("Warrantor", text("Acme Service"))};
    EXPECT_THAT(provider().modifyInstance(path, clientInstance(path, values)), isOk(0));
    EXPECT_EQ(readData("Warranty.dat"), "1\nW_1\nAcme_Service\n20240506070809.123456+120\n24\n");
    std::vector<std::string> expected = shown(values);
    expected.insert(expected.begin(), {"InstanceID=\"W 1\"", "ElementName=\"Warranty Information\""});
    EXPECT_EQ(shown(provider().getInstance(path).instances().at(0).properties), expected);
}

}  // namespace
}  // namespace contract
