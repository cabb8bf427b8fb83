#include <dlfcn.h>

#include "GateFixture.h"
#include "support/Files.h"

// Values that do not survive a round trip through the data files.

namespace gatetest {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::dateTime;

using LossyValuesTest = GateTest;

const std::vector<std::pair<std::string, std::string>> lossyStrings{{"ACME_Leasing", "underscore"},
                                                                    {"two\nlines", "line break"},
                                                                    {"a\ttab", "tab"},
                                                                    {"a\rb", "line break"},
                                                                    {" leading", "blank"},
                                                                    {"trailing ", "blank"},
                                                                    {"two  blanks", "blanks"},
                                                                    {"*", "*"},
                                                                    {"x", "one character"},
                                                                    {" ", "blank"}};

TEST_F(LossyValuesTest, AreRefusedWithAReasonAndNothingIsStored) {
    create("L1", {named("Lessor", text("ACME"))});
    const std::string stored = testsupport::readFile(dataFile("Lease.dat"));
    for (const auto& [value, reason] : lossyStrings) {
        const auto refused = isRefused(CMPI_RC_ERR_INVALID_PARAMETER, reason);
        EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(1)), named("Lessor", text(value))}), refused) << value;
        EXPECT_THAT(create("L2", {named("BaseRent", text(value))}), refused) << value;
    }
    EXPECT_EQ(testsupport::readFile(dataFile("Lease.dat")), stored);
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(LossyValuesTest, AreRefusedAsIdentifiers) {
    for (const char* id : {"a_b", "a\tb", "a\nb", " a", "a ", "a  b"}) {
        EXPECT_THAT(create(id), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "InstanceID")) << id;
        EXPECT_THAT(create(id, {}, warranty), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "InstanceID")) << id;
    }
    EXPECT_THAT(identifiers(), IsEmpty());
    for (const char* id : {"x", "*", "a b", "/system/computer"}) {
        EXPECT_THAT(create(id), isAnswered(1)) << id << " survives the round trip";
    }
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("x", "*", "a b", "/system/computer"));
}

TEST_F(LossyValuesTest, InvalidDatesAreRefused) {
    create("L1");
    for (const char* date : {"20261301000000.000000+000", "20260230000000.000000+000", "20260101240000.000000+000",
                             "2026010100****.******+000", "00000000000000.000000+060", "yesterday", ""}) {
        EXPECT_THAT(modify("L1", {named("BaseTermCommencementDate", text(date))}),
                    isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "BaseTermCommencementDate"))
            << date;
    }
    for (const char* date : {"20260101000000.000000+060", "00000012000000.000000:000"}) {
        EXPECT_THAT(modify("L1", {named("BaseTermCommencementDate", dateTime(date))}), isDone()) << date;
        EXPECT_EQ(valueIn(instanceOf("L1"), "BaseTermCommencementDate"), date);
    }
}

TEST_F(LossyValuesTest, LosslessValuesAreAccepted) {
    create("L1");
    for (const char* value : {"ACME Leasing Co", "**", "", "1.250,00 \xe2\x82\xac", "\"quoted\""}) {
        EXPECT_THAT(modify("L1", {named("Lessor", text(value))}), isDone()) << value;
        EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), value);
    }
}

TEST_F(LossyValuesTest, AStoredValueIsAcceptedAgain) {
    {
        const RefusalOff off;
        create("L1", {named("Lessor", text("ACME_Leasing"))});
        unload();
    }
    testsupport::writeFile(dataFile("Lease.dat"),
                           "1\nL1\nA_\n00000000000000.000000-000\n0\n0\n0\n0\n0\n*\n*\n*\n*\n0\n");
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "A ") << "the underscore in the file is read as a trailing blank";
    EXPECT_THAT(modify("L1", {named("Lessor", text("A ")), named("LeaseTerm", uint32(3))}), isDone());
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "3");
}

TEST_F(LossyValuesTest, AreAcceptedIfTheConfigurationPermitsThem) {
    const RefusalOff off;
    for (const char* value : {"ACME_Leasing", "a\ttab", " leading", "two  blanks", "*", "x"}) {
        const std::string id = "id_" + std::to_string(identifiers().size());
        EXPECT_THAT(create(id, {named("Lessor", text(value))}), isAnswered(1)) << value;
        EXPECT_EQ(valueIn(instanceOf(id), "Lessor"), value);
    }
    for (const char* id : {"two\nlines", "a\tb", "a\vb", "a\fb", "a\rb"}) {
        EXPECT_THAT(create(id), isRefused(CMPI_RC_ERR_FAILED, "does not hold"))
            << id << " would shift the fields of the file";
    }
    EXPECT_THAT(create("L1", {named("Lessor", text("two\nlines"))}), isAnswered(1));
    EXPECT_THAT(modify("L1", {named("LeaseTerm", uint32(3))}), isDone()) << "the record has too many lines";
    EXPECT_THAT(remove("L1"), isDone());
    unload();  // before the configuration is restored
}

TEST_F(LossyValuesTest, InvalidDatesBecomeNullIfTheConfigurationPermitsThem) {
    const RefusalOff off;
    const std::vector<std::string> none{"20261301000000.000000+000", "20260230000000.000000+000", "yesterday", ""};
    for (const std::string& date : none) {
        create("L1", {named("BaseTermCommencementDate", dateTime("20260101000000.000000+060"))});
        EXPECT_THAT(modify("L1", {named("BaseTermCommencementDate", text(date))}), isDone()) << date;
        EXPECT_EQ(valueIn(instanceOf("L1"), "BaseTermCommencementDate"), std::nullopt) << date;
        EXPECT_THAT(remove("L1"), isDone());
        EXPECT_THAT(create("L1", {named("BaseTermCommencementDate", text(date))}), isAnswered(1)) << date;
        EXPECT_THAT(remove("L1"), isDone());
    }
    const ObjectPath path = gate().enumerateInstanceNames(classPath(asset)).paths().front();
    for (const char* property : {"PurchaseDate", "ZOPMUpdateTime"}) {
        for (const char* date : {"20240229000000.000000+000", "00000001000000.000000:000"}) {
            EXPECT_THAT(gate().modifyInstance(path, testsupport::instance(path, {named(property, dateTime(date))})),
                        isDone())
                << property << ' ' << date;
        }
        EXPECT_EQ(valueIn(only(asset), property), std::nullopt) << "an interval is not a date";
    }
    unload();  // before the configuration is restored
}

TEST_F(LossyValuesTest, AreRefusedWithAnAgentWithoutSettings) {
    const RefusalOff off;
    // The gate uses the framework library that is already loaded.
    void* framework = dlopen(FRAMEWORK_WITHOUT_SETTINGS, RTLD_NOW | RTLD_LOCAL);
    ASSERT_NE(framework, nullptr) << dlerror();
    EXPECT_THAT(create("a_b"), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "underscore"));
    EXPECT_THAT(create("L1"), isAnswered(1));
    unload();
    dlclose(framework);
}

}  // namespace
}  // namespace gatetest
