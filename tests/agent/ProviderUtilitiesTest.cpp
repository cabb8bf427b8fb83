#include <gmock/gmock.h>

#include "KO/Moniker.h"
#include "KO/ProviderUtilities.h"
#include "agent/PlainValues.h"
#include "broker/RequestScope.h"

using agent_test::nullOf;
using agent_test::plain;
using agent_test::reference;
using agent_test::text;
using agent_test::textIn;
using cimhost::Instance;
using cimhost::NamedValue;
using cimhost::ObjectPath;
using KO::Moniker;
using KO::ProviderUtilities;
using testing::ElementsAre;
using testing::Pair;

namespace {

/** A request in which the utilities create objects. The tests read them as plain values. */
class ProviderUtilitiesTest : public testing::Test {
protected:
    CMPIObjectPath* path(const std::string& className, std::vector<NamedValue> keys = {}) {
        return scope.objectPath({"", "root/cimv2", className, std::move(keys)});
    }

    CMPIInstance* instance(std::vector<NamedValue> properties = {}) {
        return scope.instance({{"", "root/cimv2", "VELKO_Lease", {}}, std::move(properties)});
    }

    ObjectPath valueOf(const CMPIObjectPath* object) {
        result->ft->returnObjectPath(result, object);
        return *cimhost::resultOf<ObjectPath>(events.back());
    }

    Instance valueOf(const CMPIInstance* object) {
        result->ft->returnInstance(result, object);
        return *cimhost::resultOf<Instance>(events.back());
    }

    /** Returns the only property of an instance after it was set. */
    cimhost::Value onlyProperty(const CMPIInstance* object) {
        const Instance value = valueOf(object);
        EXPECT_EQ(value.properties.size(), 1U);
        return value.properties.empty() ? cimhost::Value() : value.properties.front().value;
    }

    cimhost::Broker host;
    cimhost::RequestScope scope{host};
    cimhost::ResultEvents events;
    CMPIResult* result = scope.result(events);
    const CMPIBroker* broker = host.handle();
};

std::vector<std::pair<std::string, std::string>> keysOf(Moniker& moniker) {
    std::vector<std::pair<std::string, std::string>> keys;
    for (unsigned int index = 0; moniker.selectKey(index); ++index) {
        keys.emplace_back();
        moniker.getName(keys.back().first);
        moniker.getValue(keys.back().second);
    }
    return keys;
}

TEST_F(ProviderUtilitiesTest, NumberTheClassesOfTheAgent) {
    const std::vector<std::pair<const char*, unsigned short>> ids = {
        {"VELKO_ComputerSystem", 1},
        {"VELKO_Lease", 20},
        {"VELKO_Warranty", 21},
        {"VELKO_LeaseSetting", 25},
        {"VELKO_WarrantySetting", 32},
        {"VELKO_OstrelAgent", 208},
        {"VELKO_AssetIDDetails", 209},
        {"velko_LEASE", 20},
        {"VELKO_Lease2", 0},
        {"VELKO_Leas", 0},
        {"", 0},
    };
    for (const auto& [name, id] : ids) {
        EXPECT_EQ(ProviderUtilities::getClassId(name), id) << name;
    }
    EXPECT_EQ(ProviderUtilities::getClassId(path("velko_warranty")), 21);
    EXPECT_EQ(ProviderUtilities::getClassId(path("CIM_System")), 0);
}

TEST_F(ProviderUtilitiesTest, ReadNamespaceAndKeysOfAPath) {
    const CMPIObjectPath* other = path("VELKO_Lease");
    const CMPIObjectPath* object =
        path("VELKO_LeaseSetting", {{"InstanceID", text("L 1")}, {"Dependent", reference(valueOf(other))}});
    EXPECT_EQ(ProviderUtilities::getNamespace(object), "root/cimv2");
    EXPECT_EQ(ProviderUtilities::getKeyCount(object), 2);
    EXPECT_EQ(ProviderUtilities::getKeyCount(other), 0);

    std::string value = "kept";
    EXPECT_TRUE(ProviderUtilities::getKeyProperty(object, "instanceid", value)) << "CIM names ignore letter case";
    EXPECT_EQ(value, "L 1");
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(object, "Name", value));
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(object, "Dependent", value));
    EXPECT_EQ(value, "L 1");

    CMPIObjectPath* found = nullptr;
    EXPECT_TRUE(ProviderUtilities::getKeyProperty(object, "Dependent", &found));
    EXPECT_EQ(valueOf(found).className, "VELKO_Lease");
    CMPIObjectPath* kept = found;
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(object, "InstanceID", &found));
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(object, "Antecedent", &found));
    EXPECT_EQ(found, kept);
}

TEST_F(ProviderUtilitiesTest, ReadOnlyStringsAsStringKeys) {
    const CMPIObjectPath* object =
        path("VELKO_Lease", {{"Number", plain(CMPI_uint32, std::uint32_t{7})}, {"Nothing", nullOf(CMPI_string)}});
    std::string value = "kept";
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(object, "Number", value));
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(object, "Nothing", value));
    EXPECT_EQ(value, "kept");
}

TEST_F(ProviderUtilitiesTest, CreatePathsWithKeys) {
    CMPIObjectPath* object = ProviderUtilities::createObjectPath(broker, "VELKO_Lease", "root/other");
    ASSERT_NE(object, nullptr);
    ProviderUtilities::setKeyProperty(object, "InstanceID", std::string("first"));
    ProviderUtilities::setKeyProperty(object, "InstanceID", std::string("L 1\n"));
    ProviderUtilities::setKeyProperty(object, "Antecedent", path("VELKO_ComputerSystem", {{"Name", text("host1")}}));

    const ObjectPath value = valueOf(object);
    EXPECT_EQ(value.className, "VELKO_Lease");
    EXPECT_EQ(value.nameSpace, "root/other");
    ASSERT_EQ(value.keys.size(), 2U);
    EXPECT_EQ(value.keys[0].name, "InstanceID");
    EXPECT_EQ(textIn(value.keys[0].value), "L 1\n");
    EXPECT_EQ(value.keys[1].value.type, CMPI_ref);
}

TEST_F(ProviderUtilitiesTest, SetPropertiesOfEveryType) {
    CMPIInstance* object = ProviderUtilities::createInstance(broker, path("VELKO_Lease"));
    ASSERT_NE(object, nullptr);
    std::string lessor = "Example";
    ProviderUtilities::setProperty(object, "Lessor", lessor);
    ProviderUtilities::setProperty(object, "ChangeableType", static_cast<unsigned short>(65535));
    ProviderUtilities::setProperty(object, "LeaseTerm", 4294967295U);
    ProviderUtilities::setProperty(object, "RenewalOption", true);
    ProviderUtilities::setProperty(object, "Dependent", path("VELKO_Lease"));
    ProviderUtilities::setProperty(broker, object, "BaseRent", lessor, false);

    const std::vector<NamedValue> properties = valueOf(object).properties;
    ASSERT_EQ(properties.size(), 6U);
    EXPECT_EQ(textIn(properties[0].value), "Example");
    EXPECT_EQ(std::get<std::uint16_t>(properties[1].value.single), 65535);
    EXPECT_EQ(std::get<std::uint32_t>(properties[2].value.single), 4294967295U);
    EXPECT_TRUE(std::get<bool>(properties[3].value.single));
    EXPECT_EQ(properties[4].value.type, CMPI_ref);
    EXPECT_EQ(textIn(properties[5].value), "Example");
}

TEST_F(ProviderUtilitiesTest, SetDateTimesFromStrings) {
    for (std::string date : {"20240229123456.000789-330", "00000010120000.000000:000"}) {
        CMPIInstance* object = instance();
        ProviderUtilities::setProperty(broker, object, "Date", date, true);
        const cimhost::Value value = onlyProperty(object);
        EXPECT_EQ(value.type, CMPI_dateTime);
        ASSERT_FALSE(value.isNull) << date;
        EXPECT_EQ(std::get<cimhost::DateTime>(value.single).value, date);
    }
}

TEST_F(ProviderUtilitiesTest, SetAnInvalidDateTimeToNull) {
    for (std::string date : {"", "00000000000000.000000-000", "20230229000000.000000+000", "20241301000000.000000+000",
                             "tomorrow", "2024"}) {
        CMPIInstance* object = instance();
        ProviderUtilities::setProperty(broker, object, "Date", date, true);
        const cimhost::Value value = onlyProperty(object);
        EXPECT_TRUE(value.isNull) << date;
        EXPECT_EQ(value.type, CMPI_dateTime) << date;
    }
}

TEST_F(ProviderUtilitiesTest, ReadStringsAndDateTimesWithEitherFlag) {
    const CMPIInstance* object =
        instance({{"Lessor", text("Example")},
                  {"Date", plain(CMPI_dateTime, cimhost::DateTime{"20240229123456.000789-330"})},
                  {"Number", plain(CMPI_uint32, std::uint32_t{7})},
                  {"NullText", nullOf(CMPI_string)},
                  {"NullDate", nullOf(CMPI_dateTime)}});
    for (const bool isDateTime : {false, true}) {
        std::string value;
        EXPECT_TRUE(ProviderUtilities::getProperty(object, "lessor", value, isDateTime));
        EXPECT_EQ(value, "Example");
        EXPECT_TRUE(ProviderUtilities::getProperty(object, "Date", value, isDateTime));
        EXPECT_EQ(value, "20240229123456.000789-330");
        for (const char* name : {"Number", "NullText", "NullDate", "None"}) {
            EXPECT_FALSE(ProviderUtilities::getProperty(object, name, value, isDateTime)) << name;
        }
        EXPECT_EQ(value, "20240229123456.000789-330") << "untouched";
    }
}

TEST_F(ProviderUtilitiesTest, ReadEveryIntegerThatFitsAnUnsignedOne) {
    const CMPIInstance* object = instance({
        {"uint8", plain(CMPI_uint8, std::uint8_t{255})},
        {"uint16", plain(CMPI_uint16, std::uint16_t{65535})},
        {"uint32", plain(CMPI_uint32, std::uint32_t{4294967295U})},
        {"uint64", plain(CMPI_uint64, std::uint64_t{4294967295U})},
        {"sint8", plain(CMPI_sint8, std::int8_t{127})},
        {"sint16", plain(CMPI_sint16, std::int16_t{32767})},
        {"sint32", plain(CMPI_sint32, std::int32_t{2147483647})},
        {"sint64", plain(CMPI_sint64, std::int64_t{4294967295})},
    });
    const std::vector<std::pair<const char*, unsigned int>> numbers = {
        {"uint8", 255}, {"uint16", 65535}, {"uint32", 4294967295U}, {"uint64", 4294967295U},
        {"sint8", 127}, {"sint16", 32767}, {"sint32", 2147483647},  {"sint64", 4294967295U},
    };
    for (const auto& [name, number] : numbers) {
        unsigned int value = 0;
        EXPECT_TRUE(ProviderUtilities::getProperty(object, name, value)) << name;
        EXPECT_EQ(value, number) << name;
    }
}

TEST_F(ProviderUtilitiesTest, RejectIntegersThatDoNotFit) {
    const CMPIInstance* object = instance({
        {"large", plain(CMPI_uint64, std::uint64_t{4294967296U})},
        {"larger", plain(CMPI_sint64, std::int64_t{4294967296})},
        {"negative8", plain(CMPI_sint8, std::int8_t{-1})},
        {"negative64", plain(CMPI_sint64, std::numeric_limits<std::int64_t>::min())},
        {"text", text("7")},
        {"flag", plain(CMPI_boolean, true)},
        {"real", plain(CMPI_real64, 7.0)},
        {"null", nullOf(CMPI_uint32)},
    });
    unsigned int value = 99;
    for (const char* name : {"large", "larger", "negative8", "negative64", "text", "flag", "real", "null", "none"}) {
        EXPECT_FALSE(ProviderUtilities::getProperty(object, name, value)) << name;
    }
    EXPECT_EQ(value, 99U);
}

TEST_F(ProviderUtilitiesTest, ReadBooleans) {
    const CMPIInstance* object = instance({{"yes", plain(CMPI_boolean, true)},
                                           {"no", plain(CMPI_boolean, false)},
                                           {"number", plain(CMPI_uint8, std::uint8_t{1})},
                                           {"null", nullOf(CMPI_boolean)}});
    bool value = false;
    EXPECT_TRUE(ProviderUtilities::getProperty(object, "yes", value));
    EXPECT_TRUE(value);
    for (const char* name : {"number", "null", "none"}) {
        EXPECT_FALSE(ProviderUtilities::getProperty(object, name, value)) << name;
    }
    EXPECT_TRUE(value) << "untouched";
    EXPECT_TRUE(ProviderUtilities::getProperty(object, "no", value));
    EXPECT_FALSE(value);
}

TEST_F(ProviderUtilitiesTest, ConvertAPathToAMoniker) {
    Moniker moniker;
    moniker.addKey("Before", "0");
    ProviderUtilities::transformObjectPathToMoniker(
        path("VELKO_Lease", {{"Name", text("host1")},
                             {"Number", plain(CMPI_sint64, std::numeric_limits<std::int64_t>::min())},
                             {"Count", plain(CMPI_uint64, std::numeric_limits<std::uint64_t>::max())},
                             {"Flag", plain(CMPI_boolean, true)},
                             {"Reference", reference({"", "root", "X", {}})},
                             {"InstanceID", text("")}}),
        moniker);
    EXPECT_THAT(keysOf(moniker),
                ElementsAre(Pair("Before", "0"), Pair("Name", "host1"), Pair("Number", "-9223372036854775808"),
                            Pair("Count", "18446744073709551615"), Pair("Flag", "true"), Pair("InstanceID", "")));
}

TEST_F(ProviderUtilitiesTest, ConvertAMonikerToKeysOfAPath) {
    Moniker moniker;
    moniker.addKey("InstanceID", "/system/computer");
    moniker.addKey("Name", "host1");
    moniker.selectKey(1);
    CMPIObjectPath* object = path("VELKO_Lease", {{"Other", text("stays")}});
    ProviderUtilities::transformMonikerToObjectPath(moniker, &object);

    const ObjectPath value = valueOf(object);
    ASSERT_EQ(value.keys.size(), 3U);
    EXPECT_EQ(textIn(value.keys[0].value), "stays");
    EXPECT_EQ(textIn(value.keys[1].value), "/system/computer");
    EXPECT_EQ(textIn(value.keys[2].value), "host1");
    std::string name;
    EXPECT_TRUE(moniker.getName(name));
    EXPECT_EQ(name, "Name") << "the selection is unchanged";
}

}  // namespace
