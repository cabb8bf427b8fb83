#include <algorithm>
#include <filesystem>

#include "AssetFixture.h"

// Reads of asset data.

namespace contract {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::named;
using testsupport::text;

class AssetReadingTest : public AssetTest {};

/** Every key of the file, each with a unique value. */
constexpr const char* fullFile =
    "USER.AssetNumber=A-1\nUSER.AssetIdTag=T-9\nUSER.Name=Ann Owner\nUSER.Phone=+49 30 1\nUSER.Position=Head\n"
    "USER.Department=Sales\nUSER.LastInventoried=20250102030405.000000+060\n"
    "USER.PurchaseDate=20240101000000.000000+000\nUSER.Location=Room 5\nUSER.ZOPMProfile=gold\n"
    "USER.ZOPMUpdateTime=20250607080910.000000-120\n"
    "USER.PersonalizedLabel1=L1\nUSER.PersonalizedData1=D1\nUSER.PersonalizedLabel2=L2\nUSER.PersonalizedData2=D2\n"
    "USER.PersonalizedLabel3=L3\nUSER.PersonalizedData3=D3\nUSER.PersonalizedLabel4=L4\nUSER.PersonalizedData4=D4\n"
    "USER.PersonalizedLabel5=L5\nUSER.PersonalizedData5=D5\n";

TEST_F(AssetReadingTest, EveryValueOfTheFileIsReturnedInOrder) {
    writeData(assetFile, fullFile);
    EXPECT_THAT(
        assetProperties(),
        ElementsAre("IdentifyingNumber=\"/system\"", "Name=\"testhost\"", "Vendor=\"Example Maker\"",
                    "Version=\"4.2.0\"", "Caption=\"Asset ID Information\"", "Description=\"Asset ID Information\"",
                    "CSName=\"testhost\"", "PrimaryOwnerName=\"Ann Owner\"", "PrimaryOwnerPhone=\"+49 30 1\"",
                    "PrimaryOwnerPosition=\"Head\"", "PrimaryOwnerDepartment=\"Sales\"", "AssetIDStringArea=1024",
                    "AssetNumber=\"A-1\"", "AssetIdTag=\"T-9\"", "ProductName=\"Model X\"", "PersonalizedLabel1=\"L1\"",
                    "PersonalizedData1=\"D1\"", "PersonalizedLabel2=\"L2\"", "PersonalizedData2=\"D2\"",
                    "PersonalizedLabel3=\"L3\"", "PersonalizedData3=\"D3\"", "PersonalizedLabel4=\"L4\"",
                    "PersonalizedData4=\"D4\"", "PersonalizedLabel5=\"L5\"", "PersonalizedData5=\"D5\"",
                    "LastInventoried=\"20250102030405.000000+060\"", "PurchaseDate=\"20240101000000.000000+000\"",
                    "SystemLocation=\"Room 5\"", "ZOPMProfile=\"gold\"", "ZOPMUpdateTime=\"20250607080910.000000-120\"",
                    "DeploymentProfile=\"gold\"", "DeploymentUpdateTime=\"20250607080910.000000-120\""));
    EXPECT_EQ(readData(assetFile), fullFile) << "reading does not change the file";
}

TEST_F(AssetReadingTest, ThePathHasFourKeys) {
    const Outcome outcome = provider().enumerateInstanceNames(path());
    EXPECT_THAT(outcome, isOk(1));
    ASSERT_EQ(outcome.paths().size(), 1U);
    EXPECT_EQ(testsupport::toText(outcome.paths()[0]), testsupport::toText(path(keys())));
    EXPECT_EQ(testsupport::toText(asset().path), testsupport::toText(path(keys())));
}

TEST_F(AssetReadingTest, AMissingFileIsCreatedEmptyAndAllValuesAreEmpty) {
    const Instance instance = asset();
    EXPECT_EQ(readData(assetFile), "");
    for (const char* name : {"PrimaryOwnerName", "PrimaryOwnerPhone", "PrimaryOwnerPosition", "PrimaryOwnerDepartment",
                             "AssetNumber", "AssetIdTag", "SystemLocation", "ZOPMProfile", "DeploymentProfile"}) {
        EXPECT_EQ(shownProperty(instance, name), "\"\"") << name;
    }
    for (const char* name : {"LastInventoried", "PurchaseDate", "ZOPMUpdateTime", "DeploymentUpdateTime"}) {
        EXPECT_EQ(shownProperty(instance, name), "NULL") << name;
        EXPECT_EQ(testsupport::find(instance.properties, name)->type, CMPI_dateTime) << name;
    }
    for (const char* number : {"1", "2", "3", "4", "5"}) {
        EXPECT_EQ(shownProperty(instance, std::string("PersonalizedLabel") + number), "\"Null\"");
        EXPECT_EQ(shownProperty(instance, std::string("PersonalizedData") + number), "\"Null\"");
    }
}

TEST_F(AssetReadingTest, AMissingDirectoryIsNotCreated) {
    provider();
    fs::remove_all(agentEnvironment::dataDirectory());
    EXPECT_EQ(property("PrimaryOwnerName"), "(none)");
    EXPECT_FALSE(fs::exists(agentEnvironment::dataDirectory()));
}

TEST_F(AssetReadingTest, EnumerationOfNamesCreatesTheFile) {
    provider().enumerateInstanceNames(path());
    EXPECT_EQ(readData(assetFile), "");
}

TEST_F(AssetReadingTest, MissingPersonalizedValuesAreReturnedAsPlaceholders) {
    writeData(assetFile, "USER.PersonalizedLabel3=Cost centre\n");
    const Instance instance = asset();
    for (const char* number : {"1", "2", "4", "5"}) {
        EXPECT_EQ(shownProperty(instance, std::string("PersonalizedLabel") + number), "\"Null\"");
        EXPECT_EQ(shownProperty(instance, std::string("PersonalizedData") + number), "\"Null\"");
    }
    EXPECT_EQ(shownProperty(instance, "PersonalizedLabel3"), "\"Cost centre\"");
    EXPECT_EQ(shownProperty(instance, "PersonalizedData3"), "\"Null\"");
}

TEST_F(AssetReadingTest, TheFileIsReadInEachRequest) {
    writeData(assetFile, "USER.AssetNumber=1\n");
    EXPECT_EQ(property("AssetNumber"), "\"1\"");
    writeData(assetFile, "USER.AssetNumber=2\n");
    EXPECT_EQ(property("AssetNumber"), "\"2\"");
}

TEST_F(AssetReadingTest, AnInvalidDateIsNull) {
    writeData(assetFile,
              "USER.LastInventoried=yesterday\nUSER.PurchaseDate=00000000000000.000000-000\n"
              "USER.ZOPMUpdateTime=20251301000000.000000+000\n");
    const Instance instance = asset();
    for (const char* name : {"LastInventoried", "PurchaseDate", "ZOPMUpdateTime", "DeploymentUpdateTime"}) {
        EXPECT_EQ(shownProperty(instance, name), "NULL") << name;
    }
}

TEST_F(AssetReadingTest, LocalDateTimeIsATimeWithOffset) {
    const auto now = testsupport::dateTimeOf(asset().properties, "LocalDateTime");
    ASSERT_TRUE(now.has_value());
    EXPECT_EQ(now->size(), 25U);
    EXPECT_THAT(now->at(21), testing::AnyOf('+', '-'));
    EXPECT_GT(*now, "2020") << "the current time, not 1970";
}

TEST_F(AssetReadingTest, ThePropertyListIsNotApplied) {
    const Outcome outcome = provider().getInstance(path(keys()), std::vector<std::string>{"AssetNumber"});
    ASSERT_EQ(outcome.instances().size(), 1U);
    EXPECT_EQ(outcome.instances()[0].properties.size(), 33U);
}

TEST_F(AssetReadingTest, TheInstanceIsReturnedIfAllKeysAreEqual) {
    const Outcome outcome = provider().getInstance(path(keys()));
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_EQ(outcome.instances().size(), 1U);
}

TEST_F(AssetReadingTest, TheInstanceIsNotReturnedIfOneKeyDiffers) {
    for (std::size_t index = 0; index < keys().size(); ++index) {
        std::vector<NamedValue> wrong = keys();
        for (const char* value : {"other", "", "TESTHOST", "example maker", "4.2.0 "}) {
            wrong[index].value = text(value);
            const Outcome outcome = provider().getInstance(path(wrong));
            EXPECT_THAT(outcome, isOk(1));
            EXPECT_THAT(outcome.instances(), IsEmpty()) << wrong[index].name << " " << value;
        }
    }
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_F(AssetReadingTest, EachKeyIsComparedIndividually) {
    for (const NamedValue& key : keys()) {
        EXPECT_EQ(provider().getInstance(path({key})).instances().size(), 1U) << key.name;
        EXPECT_THAT(provider().getInstance(path({named(key.name, text("other"))})).instances(), IsEmpty()) << key.name;
    }
}

TEST_F(AssetReadingTest, KeysAreComparedInAFixedOrder) {
    provider().getInstance(path(keys()));
    std::vector<std::string> types;
    for (const LogRecord& record : logOf()) {
        if (record.function == "setFilter" && record.text.rfind("ENTERING", 0) == 0) {
            types.push_back(record.text.substr(record.text.find(" filterType=") + 12, 1));
        }
    }
    EXPECT_THAT(types, ElementsAre("1", "0", "2", "3"));
}

TEST_F(AssetReadingTest, KeyNamesAreCaseInsensitive) {
    EXPECT_EQ(provider().getInstance(path({named("VENDOR", text("Example Maker"))})).instances().size(), 1U);
    EXPECT_THAT(provider().getInstance(path({named("vendor", text("other"))})).instances(), IsEmpty());
}

TEST_F(AssetReadingTest, KeysWithOtherNamesOrTypesAreIgnored) {
    EXPECT_EQ(provider().getInstance(path({named("Tag", text("other"))})).instances().size(), 1U);
    EXPECT_EQ(provider().getInstance(path({named("Version", testsupport::uint32(4))})).instances().size(), 1U);
    EXPECT_EQ(provider().getInstance(path({named("Name", testsupport::nullOf(CMPI_string))})).instances().size(), 1U);
}

TEST_F(AssetReadingTest, KeysOfEnumerationPathsAreCompared) {
    const ObjectPath other = path({named("Name", text("other"))});
    EXPECT_THAT(provider().enumerateInstances(other).instances(), IsEmpty());
    EXPECT_THAT(provider().enumerateInstanceNames(other), isOk(1));
    EXPECT_THAT(provider().enumerateInstanceNames(other).paths(), IsEmpty());
}

TEST_F(AssetReadingTest, AnUnreadableFileStillReturnsThePropertiesOfTheComputer) {
    blockData(assetFile);
    const Instance instance = asset();
    EXPECT_THAT(testsupport::namesOf(instance.properties),
                ElementsAre("IdentifyingNumber", "Name", "Vendor", "Version", "Caption", "Description", "CSName",
                            "AssetIDStringArea", "ProductName", "LocalDateTime"));
    EXPECT_EQ(testsupport::toText(instance.path), testsupport::toText(path(keys())));
    EXPECT_EQ(provider().getInstance(path(keys())).instances().size(), 1U);
}

TEST_F(AssetReadingTest, AnUnreadableFileIsOnlyLogged) {
    blockData(assetFile);
    EXPECT_THAT(provider().enumerateInstances(path()), isOk(1));
    EXPECT_THAT(loggedFailures(), IsEmpty());
    std::vector<std::string> loud;
    for (const LogRecord& record : agentEnvironment::log()) {
        if (record.level > 4000) {
            loud.push_back(record.channel + " " + std::to_string(record.level) + " " + record.text.substr(0, 7));
        }
    }
    EXPECT_THAT(loud, ElementsAre("log 6000 MESSAGE", "trace 6000 MESSAGE"));
}

TEST_F(AssetReadingTest, AFileThatBecomesReadableIsRead) {
    blockData(assetFile);
    EXPECT_EQ(property("AssetNumber"), "(none)");
    freeData(assetFile);
    writeData(assetFile, "USER.AssetNumber=1\n");
    EXPECT_EQ(property("AssetNumber"), "\"1\"");
}

TEST_F(AssetReadingTest, ObjectsThatCannotBeCreatedAreSkipped) {
    for (const char* function : {"CMPIBrokerEncFT.newObjectPath", "CMPIBrokerEncFT.newInstance"}) {
        broker.failCall(function, 1, CMPI_RC_ERR_FAILED);
        const Outcome outcome = provider().enumerateInstances(path());
        EXPECT_THAT(outcome, isOk(1)) << function;
        EXPECT_THAT(outcome.instances(), IsEmpty()) << function;
    }
    broker.failCall("CMPIBrokerEncFT.newObjectPath", 1, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(provider().enumerateInstanceNames(path()).paths(), IsEmpty());
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_F(AssetReadingTest, AssetDataCannotBeCreatedOrDeleted) {
    const Instance instance = clientInstance(path(keys()), {named("AssetNumber", text("1"))});
    EXPECT_THAT(provider().createInstance(path(keys()), instance), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    EXPECT_THAT(provider().deleteInstance(path(keys())), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    EXPECT_EQ(readData(assetFile), std::nullopt) << "a rejected request does not access the file";
}

}  // namespace
}  // namespace contract
