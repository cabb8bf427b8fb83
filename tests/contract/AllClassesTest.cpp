#include <algorithm>
#include <filesystem>
#include <iterator>
#include <set>

#include "AssetFixture.h"
#include "AssociationFixture.h"
#include "schema/MofReader.h"
#include "schema/MofWriter.h"

// Checks for every class that the table below matches the MOF file, and that the operations are consistent with each
// other. The MOF file declares keys in the order of paths, and other properties in the order of instances.

namespace contract {
namespace {

using testing::IsEmpty;

/** Traits of a property. */
enum Trait : unsigned {
    plain = 0,
    key = 1,
    writable = 2,
    never = 4,  ///< declared in the class but never set by the provider
};

struct PropertyRow {
    const char* name;
    CMPIType type;
    unsigned traits = plain;
};

struct ClassRow {
    const char* name;
    std::vector<PropertyRow> properties;  ///< in the order of instances
    bool supportsGet = true;
};

std::ostream& operator<<(std::ostream& stream, const ClassRow& row) {
    return stream << row.name;
}

const std::vector<ClassRow>& classes() {
    static const std::vector<ClassRow> all{
        {"VELKO_Lease",
         {{"Caption", CMPI_string, never},
          {"Description", CMPI_string, never},
          {"InstanceID", CMPI_string, key},
          {"ElementName", CMPI_string},
          {"ConfigurationName", CMPI_string, never},
          {"ChangeableType", CMPI_uint16, never},
          {"Lessor", CMPI_string, writable},
          {"BaseTermCommencementDate", CMPI_dateTime, writable},
          {"LeaseTerm", CMPI_uint32, writable},
          {"EarlyTerminationOption", CMPI_boolean, writable},
          {"FixedPricePurchaseOption", CMPI_boolean, writable},
          {"RenewalOption", CMPI_boolean, writable},
          {"BargainRenewalOption", CMPI_boolean, writable},
          {"BaseRent", CMPI_string, writable},
          {"FairMarketRental", CMPI_string, writable},
          {"FairMarketValue", CMPI_string, writable},
          {"TerminationValue", CMPI_string, writable},
          {"NetMonthlyLeaseRateFactor", CMPI_uint32, writable}}},
        {"VELKO_Warranty",
         {{"Caption", CMPI_string, never},
          {"Description", CMPI_string, never},
          {"InstanceID", CMPI_string, key},
          {"ElementName", CMPI_string},
          {"ConfigurationName", CMPI_string, never},
          {"ChangeableType", CMPI_uint16, never},
          {"WarrantyStartDate", CMPI_dateTime, writable},
          {"WarrantyDuration", CMPI_uint32, writable},
          {"Warrantor", CMPI_string, writable}}},
        {"VELKO_LeaseSetting", {{"Antecedent", CMPI_ref, key}, {"Dependent", CMPI_ref, key}}, false},
        {"VELKO_WarrantySetting", {{"Antecedent", CMPI_ref, key}, {"Dependent", CMPI_ref, key}}, false},
        {"VELKO_OstrelAgent",
         {{"Caption", CMPI_string},
          {"Description", CMPI_string},
          {"BuildNumber", CMPI_string},
          {"Status", CMPI_string},
          {"Name", CMPI_string, key},
          {"ProductName", CMPI_string, key},
          {"IdentifyingNumber", CMPI_string, key},
          {"Vendor", CMPI_string, key},
          {"Version", CMPI_string, key}}},
        {"VELKO_AssetIDDetails",
         {{"IdentifyingNumber", CMPI_string, key},
          {"Name", CMPI_string, key},
          {"Vendor", CMPI_string, key},
          {"Version", CMPI_string, key},
          {"Caption", CMPI_string},
          {"Description", CMPI_string},
          {"CSName", CMPI_string},
          {"PrimaryOwnerName", CMPI_string, writable},
          {"PrimaryOwnerPhone", CMPI_string, writable},
          {"PrimaryOwnerPosition", CMPI_string, writable},
          {"PrimaryOwnerDepartment", CMPI_string, writable},
          {"AssetIDStringArea", CMPI_uint32},
          {"AssetNumber", CMPI_string, writable},
          {"AssetIdTag", CMPI_string},
          {"ProductName", CMPI_string},
          {"PersonalizedLabel1", CMPI_string, writable},
          {"PersonalizedData1", CMPI_string, writable},
          {"PersonalizedLabel2", CMPI_string, writable},
          {"PersonalizedData2", CMPI_string, writable},
          {"PersonalizedLabel3", CMPI_string, writable},
          {"PersonalizedData3", CMPI_string, writable},
          {"PersonalizedLabel4", CMPI_string, writable},
          {"PersonalizedData4", CMPI_string, writable},
          {"PersonalizedLabel5", CMPI_string, writable},
          {"PersonalizedData5", CMPI_string, writable},
          {"LastInventoried", CMPI_dateTime, writable},
          {"PurchaseDate", CMPI_dateTime, writable},
          {"SystemLocation", CMPI_string, writable},
          {"LocalDateTime", CMPI_dateTime},
          {"ZOPMProfile", CMPI_string, writable},
          {"ZOPMUpdateTime", CMPI_dateTime, writable},
          {"DeploymentProfile", CMPI_string},
          {"DeploymentUpdateTime", CMPI_dateTime}}},
    };
    return all;
}

/** Returns a string with name and type for each accepted row. */
template <class Accepts>
std::vector<std::string> described(const std::vector<PropertyRow>& rows, Accepts accepts) {
    std::vector<std::string> strings;
    for (const PropertyRow& row : rows) {
        if (accepts(row)) {
            strings.push_back(std::string(row.name) + " " + std::to_string(row.type));
        }
    }
    return strings;
}

cimhost::Schema readSchema() {
    cimhost::Schema read;
    const std::filesystem::path golden(CONTRACT_GOLDEN);
    cimhost::MofReader(read).readFile(golden / "../../../schema/velko.mof");
    return read;
}

/** Returns the classes that the MOF file declares. */
const cimhost::Schema& schema() {
    static const cimhost::Schema read = readSchema();
    return read;
}

bool isWritable(const cimhost::Property& property) {
    const cimhost::Qualifier* write = property.findQualifier("Write");
    return write != nullptr && std::get<bool>(write->value.single);
}

/** Returns a value that differs from the property's value in the test data. */
cimhost::Value otherValue(const PropertyRow& row) {
    const std::string name = row.name;
    switch (row.type) {
        case CMPI_uint16:
            return testsupport::uint16(4711);
        case CMPI_uint32:
            return testsupport::uint32(4711);
        case CMPI_dateTime:
            return testsupport::dateTime("203004050607" + std::to_string(10 + name.size()) + ".000000+120");
        default:
            return testsupport::text("another " + name);
    }
}

/** Returns a property as a string. Omits a value that changes over time. */
std::string comparable(const NamedValue& property) {
    return property.name == "LocalDateTime" ? property.name.string() : shown({property}).at(0);
}

std::vector<std::string> comparable(const std::vector<Instance>& instances) {
    std::vector<std::string> strings;
    for (const Instance& instance : instances) {
        strings.push_back(testsupport::toText(instance.path));
        std::transform(instance.properties.begin(), instance.properties.end(), std::back_inserter(strings),
                       [](const NamedValue& property) { return comparable(property); });
    }
    return strings;
}

/** A provider with two leases, two warranties, one computer system and complete asset data. */
class AllClassesTest : public ProviderTest, public testing::WithParamInterface<ClassRow> {
protected:
    AllClassesTest() {
        writeData(leases.dataFile, recordFile(leases, {"A", "B"}));
        writeData(warranties.dataFile, recordFile(warranties, {"A", "B"}));
        writeData(assetFile,
                  "USER.LastInventoried=20250102030405.000000+060\nUSER.PurchaseDate=20240101000000.000000"
                  "+000\nUSER.ZOPMUpdateTime=20250607080910.000000-120\n");
        broker.serve("VELKO_ComputerSystem", {computerSystem("testhost")});
    }

    static const ClassRow& row() { return GetParam(); }
    std::vector<ObjectPath> names() { return provider().enumerateInstanceNames(classPath(row().name)).paths(); }
    std::vector<Instance> instances() { return provider().enumerateInstances(classPath(row().name)).instances(); }
};

std::string className(const testing::TestParamInfo<ClassRow>& info) {
    return std::string(info.param.name).substr(6);
}

INSTANTIATE_TEST_SUITE_P(Classes, AllClassesTest, testing::ValuesIn(classes()), className);

TEST_P(AllClassesTest, TheMofDeclaresTheSameProperties) {
    const cimhost::Class* declared = schema().findClass(row().name);
    ASSERT_NE(declared, nullptr);
    std::vector<PropertyRow> rows;
    for (const cimhost::Property& property : declared->properties) {
        EXPECT_FALSE(property.isArray) << property.name;
        rows.push_back({property.name.c_str(), property.type,
                        (property.isKey() ? key : plain) | (isWritable(property) ? writable : plain)});
    }
    const auto keys = [](const PropertyRow& each) { return (each.traits & key) != 0; };
    const auto others = [](const PropertyRow& each) { return (each.traits & key) == 0; };
    const auto writables = [](const PropertyRow& each) { return (each.traits & writable) != 0; };
    EXPECT_THAT(described(rows, keys), testing::UnorderedElementsAreArray(described(row().properties, keys)));
    EXPECT_EQ(described(rows, others), described(row().properties, others));
    EXPECT_EQ(described(rows, writables), described(row().properties, writables));
}

TEST_P(AllClassesTest, TheMofDeclaresTheKeysInTheOrderOfPaths) {
    std::vector<std::string> declared;
    for (const cimhost::Property& property : schema().findClass(row().name)->properties) {
        if (property.isKey()) {
            declared.push_back(property.name);
        }
    }
    const auto paths = names();
    ASSERT_THAT(paths, testing::Not(IsEmpty()));
    for (const ObjectPath& path : paths) {
        std::vector<std::string> carried;
        for (const NamedValue& each : path.keys) {
            carried.push_back(each.name);
        }
        EXPECT_EQ(carried, declared);
    }
}

TEST_P(AllClassesTest, InstancesHaveThePropertiesInOrder) {
    const auto expected =
        described(row().properties, [](const PropertyRow& each) { return (each.traits & never) == 0; });
    const auto found = instances();
    ASSERT_THAT(found, testing::Not(IsEmpty()));
    for (const Instance& instance : found) {
        std::vector<PropertyRow> rows;
        for (const NamedValue& property : instance.properties) {
            EXPECT_FALSE(property.value.isArray) << property.name;
            EXPECT_FALSE(property.value.isNull) << property.name;
            rows.push_back({property.name.string().c_str(), property.value.type});
        }
        EXPECT_EQ(described(rows, [](const PropertyRow&) { return true; }), expected);
    }
}

TEST_P(AllClassesTest, EnumeratedNamesAreThePathsOfEnumeratedInstances) {
    std::vector<ObjectPath> ofInstances;
    for (const Instance& instance : instances()) {
        ofInstances.push_back(instance.path);
    }
    const auto strings = stringsOf(names());
    EXPECT_EQ(stringsOf(ofInstances), strings);
    EXPECT_EQ(std::set<std::string>(strings.begin(), strings.end()).size(), strings.size()) << "duplicate name";
}

TEST_P(AllClassesTest, PathsHaveTheClassAndItsKeys) {
    const auto keys = described(row().properties, [](const PropertyRow& each) { return (each.traits & key) != 0; });
    for (const ObjectPath& path : names()) {
        EXPECT_EQ(path.className, row().name);
        EXPECT_EQ(path.nameSpace, nameSpace);
        std::vector<PropertyRow> rows;
        for (const NamedValue& each : path.keys) {
            rows.push_back({each.name.string().c_str(), each.value.type});
        }
        EXPECT_THAT(described(rows, [](const PropertyRow&) { return true; }), testing::UnorderedElementsAreArray(keys));
    }
}

TEST_P(AllClassesTest, KeyPropertiesEqualTheKeysOfThePath) {
    for (const Instance& instance : instances()) {
        for (const NamedValue& each : instance.path.keys) {
            const cimhost::Value* property = testsupport::find(instance.properties, each.name);
            ASSERT_NE(property, nullptr) << each.name;
            EXPECT_EQ(cimhost::formatMof(*property), cimhost::formatMof(each.value)) << each.name;
        }
    }
}

TEST_P(AllClassesTest, GetReturnsEachEnumeratedInstanceExceptAssociations) {
    for (const Instance& enumerated : instances()) {
        const Outcome outcome = provider().getInstance(enumerated.path);
        if (!row().supportsGet) {
            EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_NOT_SUPPORTED));
            continue;
        }
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_EQ(comparable(outcome.instances()), comparable(std::vector<Instance>{enumerated}));
    }
}

TEST_P(AllClassesTest, RepeatedEnumerationsAreEqual) {
    const auto first = comparable(instances());
    const auto firstNames = stringsOf(names());
    EXPECT_EQ(comparable(instances()), first);
    EXPECT_EQ(stringsOf(names()), firstNames);
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(AllClassesTest, ModificationChangesOnlyTheWritableProperties) {
    const ObjectPath path = names().at(0);
    const bool hasWritable = std::any_of(row().properties.begin(), row().properties.end(),
                                         [](const PropertyRow& each) { return (each.traits & writable) != 0; });
    for (const PropertyRow& each : row().properties) {
        if (each.type == CMPI_ref) {
            continue;
        }
        const Instance before = instances().at(0);
        const auto flag = testsupport::valueOf<bool>(before.properties, each.name);
        const cimhost::Value value = flag ? testsupport::boolean(!*flag) : otherValue(each);
        const Outcome outcome =
            provider().modifyInstance(path, clientInstance(path, {testsupport::named(each.name, value)}));
        if (!hasWritable) {
            EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_INVALID_CLASS));
            continue;
        }
        EXPECT_THAT(outcome, isOk(0));
        const Instance after = instances().at(0);
        const cimhost::Value* changed = testsupport::find(after.properties, each.name);
        const bool isChanged = changed != nullptr && cimhost::formatMof(*changed) == cimhost::formatMof(value);
        EXPECT_EQ(isChanged, (each.traits & writable) != 0) << each.name;
    }
}

TEST_P(AllClassesTest, OtherInstancesAreUnchanged) {
    const auto before = instances();
    const ObjectPath path = before.at(0).path;
    for (const PropertyRow& each : row().properties) {
        provider().modifyInstance(path, clientInstance(path, {testsupport::named(each.name, otherValue(each))}));
    }
    const auto after = instances();
    ASSERT_EQ(after.size(), before.size());
    EXPECT_EQ(comparable(std::vector<Instance>(after.begin() + 1, after.end())),
              comparable(std::vector<Instance>(before.begin() + 1, before.end())));
}

}  // namespace
}  // namespace contract
