#include <filesystem>

#include "AssetFixture.h"
#include "ThrowingObjects.h"

// Modification of asset data.

namespace contract {
namespace {

namespace fs = std::filesystem;
using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testsupport::dateTime;
using testsupport::named;
using testsupport::text;

constexpr const char* writingFailed = "Throwing Exception while writing Data";

class AssetModificationTest : public AssetTest {
protected:
    /** Returns labels and data of the five pairs in the file. */
    static std::vector<std::string> storedPairs() {
        std::vector<std::string> pairs;
        for (const char* number : {"1", "2", "3", "4", "5"}) {
            pairs.push_back(stored(std::string("USER.PersonalizedLabel") + number) + "|" +
                            stored(std::string("USER.PersonalizedData") + number));
        }
        return pairs;
    }

    static bool isLogged(const std::string& message) {
        return testing::Matches(Contains(Field(&LogRecord::text, HasSubstr(message))))(logOf());
    }
};

TEST_F(AssetModificationTest, EachWritablePropertyIsStoredWithItsKey) {
    modify({named("AssetNumber", text("A-2")), named("PrimaryOwnerName", text("Bob")),
            named("PrimaryOwnerPhone", text("12")), named("PrimaryOwnerPosition", text("Clerk")),
            named("PrimaryOwnerDepartment", text("Law")),
            named("LastInventoried", dateTime("20260102030405.000000+060")),
            named("PurchaseDate", dateTime("20250101000000.000000-300")), named("SystemLocation", text("Hall")),
            named("ZOPMProfile", text("silver")), named("ZOPMUpdateTime", dateTime("20260708091011.000000+000"))});
    EXPECT_EQ(stored("USER.AssetNumber"), "A-2");
    EXPECT_EQ(stored("USER.Name"), "Bob");
    EXPECT_EQ(stored("USER.Phone"), "12");
    EXPECT_EQ(stored("USER.Position"), "Clerk");
    EXPECT_EQ(stored("USER.Department"), "Law");
    EXPECT_EQ(stored("USER.LastInventoried"), "20260102030405.000000+060");
    EXPECT_EQ(stored("USER.PurchaseDate"), "20250101000000.000000-300");
    EXPECT_EQ(stored("USER.Location"), "Hall");
    EXPECT_EQ(stored("USER.ZOPMProfile"), "silver");
    EXPECT_EQ(stored("USER.ZOPMUpdateTime"), "20260708091011.000000+000");
}

TEST_F(AssetModificationTest, EveryKeyIsWrittenInOrder) {
    modify({});
    EXPECT_THAT(storedKeys(),
                ElementsAre("USER.AssetNumber", "USER.AssetIdTag", "USER.Name", "USER.Phone", "USER.Position",
                            "USER.Department", "USER.LastInventoried", "USER.PurchaseDate", "USER.Location",
                            "USER.ZOPMProfile", "USER.ZOPMUpdateTime", "USER.PersonalizedLabel1",
                            "USER.PersonalizedData1", "USER.PersonalizedLabel2", "USER.PersonalizedData2",
                            "USER.PersonalizedLabel3", "USER.PersonalizedData3", "USER.PersonalizedLabel4",
                            "USER.PersonalizedData4", "USER.PersonalizedLabel5", "USER.PersonalizedData5"));
}

TEST_F(AssetModificationTest, AModificationIsVisibleToTheNextRequestAndAfterReloading) {
    const std::vector<NamedValue> changes{named("AssetNumber", text("A-2")),
                                          named("PrimaryOwnerName", text("Bob")),
                                          named("LastInventoried", dateTime("20260102030405.000000+060")),
                                          named("PurchaseDate", dateTime("20250101000000.000000-300")),
                                          named("SystemLocation", text("Hall")),
                                          named("ZOPMProfile", text("silver")),
                                          named("ZOPMUpdateTime", dateTime("20260708091011.000000+000"))};
    modify(changes);
    const auto after = assetProperties();
    for (const std::string& change : shown(changes)) {
        EXPECT_THAT(after, Contains(change));
    }
    EXPECT_THAT(after, Contains("DeploymentProfile=\"silver\""));
    EXPECT_THAT(after, Contains("DeploymentUpdateTime=\"20260708091011.000000+000\""));
    unload();
    EXPECT_EQ(assetProperties(), after);
}

TEST_F(AssetModificationTest, AnyStringIsReadBackUnchanged) {
    for (const char* value : {"", " ", " ends ", "a=b", "#5", "back\\slash", "two\nlines", "tab\t", "\xC3\xA9t\xC3\xA9",
                              "under_score", "*", "Null"}) {
        modify({named("PrimaryOwnerName", text(value))});
        const Instance instance = asset();
        EXPECT_EQ(testsupport::stringOf(instance.properties, "PrimaryOwnerName"), value);
    }
}

TEST_F(AssetModificationTest, PropertiesThatAreNotSentKeepTheirValues) {
    writeData(assetFile,
              "USER.AssetNumber=A-1\nUSER.Name=Ann\nUSER.Phone=1\n"
              "USER.LastInventoried=20250102030405.000000+060\n");
    modify({named("PrimaryOwnerPhone", text("2")), named("AssetNumber", testsupport::nullOf(CMPI_string)),
            named("LastInventoried", testsupport::nullOf(CMPI_dateTime))});
    EXPECT_EQ(stored("USER.AssetNumber"), "A-1");
    EXPECT_EQ(stored("USER.Name"), "Ann");
    EXPECT_EQ(stored("USER.Phone"), "2");
    EXPECT_EQ(stored("USER.LastInventoried"), "20250102030405.000000+060");
}

TEST_F(AssetModificationTest, TheTagIsReadOnly) {
    writeData(assetFile, "USER.AssetIdTag=T-9\n");
    modify({named("AssetIdTag", text("T-10")), named("AssetNumber", text("A-2"))});
    EXPECT_EQ(stored("USER.AssetIdTag"), "T-9");
    EXPECT_EQ(property("AssetIdTag"), "\"T-9\"");
}

TEST_F(AssetModificationTest, ReadOnlyPropertiesAreIgnored) {
    writeData(assetFile, "USER.ZOPMProfile=gold\nUSER.ZOPMUpdateTime=20250607080910.000000-120\n");
    const auto before = assetProperties();
    modify({named("DeploymentProfile", text("silver")),
            named("DeploymentUpdateTime", dateTime("20260708091011.000000+000")), named("Name", text("other")),
            named("CSName", text("other")), named("Vendor", text("other")), named("Version", text("other")),
            named("IdentifyingNumber", text("other")), named("Caption", text("other")),
            named("Description", text("other")), named("ProductName", text("other")),
            named("AssetIDStringArea", testsupport::uint32(1)),
            named("LocalDateTime", dateTime("20260708091011.000000+000")), named("NoSuchProperty", text("other"))});
    EXPECT_EQ(assetProperties(), before);
}

TEST_F(AssetModificationTest, UnknownKeysStayInTheFile) {
    writeData(assetFile, "# inventory\nOTHER.Key=kept\nUSER.AssetNumber=A-1\n\nno assignment\nUSER.Other=kept too\n");
    modify({named("AssetNumber", text("A-2"))});
    EXPECT_THAT(*readData(assetFile), testing::StartsWith("# inventory\nOTHER.Key=kept\nUSER.AssetNumber=A-2\n\n"
                                                          "no assignment\nUSER.Other=kept too\nUSER.AssetIdTag=\n"));
}

TEST_F(AssetModificationTest, AllFivePairsAreStored) {
    std::vector<NamedValue> pairs;
    for (const char* number : {"1", "2", "3", "4", "5"}) {
        pairs.push_back(named(std::string("PersonalizedLabel") + number, text(std::string("L") + number)));
        pairs.push_back(named(std::string("PersonalizedData") + number, text(std::string("D") + number)));
    }
    modify(pairs);
    EXPECT_THAT(storedPairs(), ElementsAre("L1|D1", "L2|D2", "L3|D3", "L4|D4", "L5|D5"));
    for (const std::string& pair : shown(pairs)) {
        EXPECT_THAT(assetProperties(), Contains(pair));
    }
}

TEST_F(AssetModificationTest, AnOmittedPairRepeatsThePrecedingPair) {
    modify({named("PersonalizedLabel2", text("Room"))});
    EXPECT_THAT(storedPairs(), ElementsAre("|", "Room|", "Room|", "Room|", "Room|"));
    EXPECT_EQ(property("PersonalizedLabel1"), "\"Null\"");
    EXPECT_EQ(property("PersonalizedLabel2"), "\"Room\"");
    EXPECT_EQ(property("PersonalizedData2"), "\"Null\"");
    EXPECT_EQ(property("PersonalizedLabel5"), "\"Room\"");
}

TEST_F(AssetModificationTest, LabelsAndDataRepeatIndependently) {
    modify({named("PersonalizedLabel1", text("L1")), named("PersonalizedData1", text("D1")),
            named("PersonalizedData3", text("D3")), named("PersonalizedLabel4", text("L4")),
            named("PersonalizedData4", testsupport::nullOf(CMPI_string))});
    EXPECT_THAT(storedPairs(), ElementsAre("L1|D1", "L1|D1", "L1|D3", "L4|D3", "L4|D3"));
}

TEST_F(AssetModificationTest, AModificationWithoutPairsClearsThem) {
    writeData(assetFile, "USER.PersonalizedLabel1=L1\nUSER.PersonalizedData1=D1\nUSER.PersonalizedLabel5=L5\n");
    modify({named("AssetNumber", text("A-2"))});
    EXPECT_THAT(storedPairs(), Each("|"));
    EXPECT_EQ(property("PersonalizedLabel1"), "\"Null\"");
}

TEST_F(AssetModificationTest, AnEmptyValueIsRepeatedAsEmpty) {
    modify({named("PersonalizedLabel1", text("L1")), named("PersonalizedLabel2", text(""))});
    EXPECT_THAT(storedPairs(), ElementsAre("L1|", "|", "|", "|", "|"));
}

TEST_F(AssetModificationTest, ADateCanBeSentAsAString) {
    modify({named("LastInventoried", text("20260102030405.000000+060"))});
    EXPECT_EQ(property("LastInventoried"), "\"20260102030405.000000+060\"");
}

TEST_F(AssetModificationTest, AnInvalidDateClearsTheDate) {
    writeData(assetFile,
              "USER.LastInventoried=20250102030405.000000+060\nUSER.PurchaseDate=20240101000000.000000+000\n");
    modify({named("LastInventoried", text("some day")), named("PurchaseDate", text("00000000000000.000000-000"))});
    EXPECT_EQ(property("LastInventoried"), "NULL");
    EXPECT_EQ(property("PurchaseDate"), "NULL");
}

TEST_F(AssetModificationTest, APropertyOfAnotherTypeIsIgnored) {
    writeData(assetFile, "USER.AssetNumber=A-1\nUSER.Name=Ann\n");
    modify({named("AssetNumber", testsupport::uint32(7)), named("PrimaryOwnerName", testsupport::boolean(true))});
    EXPECT_EQ(stored("USER.AssetNumber"), "A-1");
    EXPECT_EQ(stored("USER.Name"), "Ann");
}

TEST_F(AssetModificationTest, ThePropertyListIsNotApplied) {
    const Outcome outcome = provider().modifyInstance(
        path(keys()),
        clientInstance(path(keys()), {named("AssetNumber", text("A-2")), named("PrimaryOwnerName", text("Bob"))}),
        std::vector<std::string>{"AssetNumber"});
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_EQ(stored("USER.AssetNumber"), "A-2");
    EXPECT_EQ(stored("USER.Name"), "Bob");
}

TEST_F(AssetModificationTest, ANullInstanceWritesNothing) {
    writeData(assetFile, "USER.AssetNumber=A-1\n");
    CMPIInstanceMI* interface = provider().instanceMI();
    const Outcome outcome =
        provider().call([&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
            return interface->ft->modifyInstance(interface, context, result, scope.objectPath(path(keys())), nullptr,
                                                 nullptr);
        });
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_EQ(readData(assetFile), "USER.AssetNumber=A-1\n");
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_F(AssetModificationTest, AModificationWithAPathThatSelectsNothingIsWritten) {
    const ObjectPath other = path({named("Version", text("other"))});
    EXPECT_THAT(provider().modifyInstance(other, clientInstance(other, {named("AssetNumber", text("A-2"))})), isOk(0));
    EXPECT_EQ(stored("USER.AssetNumber"), "A-2");
}

TEST_F(AssetModificationTest, AnUnreadableFileIsRewrittenWithTheSentValuesAndEmptyStrings) {
    blockData(assetFile);
    CMPIInstanceMI* interface = provider().instanceMI();
    static CMPIData (*original)(const CMPIInstance*, const char*, CMPIStatus*);
    const Outcome outcome = provider().call([&](auto& scope, const CMPIContext* context, const CMPIResult* result) {
        Altered<CMPIInstance> altered(scope.instance(
            clientInstance(path(keys()), {named("AssetNumber", text("A-2")), named("PersonalizedData2", text("Room")),
                                          named("PurchaseDate", dateTime("20250101000000.000000-300"))})));
        original = altered.table.getProperty;
        altered.table.getProperty = [](const CMPIInstance* instance, const char* name, CMPIStatus* status) {
            freeData(assetFile);  // the file was unreadable when the request started, and is writable now
            return original(instance, name, status);
        };
        return interface->ft->modifyInstance(interface, context, result, scope.objectPath(path(keys())),
                                             altered.handle(), nullptr);
    });
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_EQ(stored("USER.AssetNumber"), "A-2");
    EXPECT_EQ(stored("USER.PurchaseDate"), "20250101000000.000000-300");
    EXPECT_THAT(storedPairs(), ElementsAre("|", "|Room", "|Room", "|Room", "|Room"));
    for (const char* key : {"USER.AssetIdTag", "USER.Name", "USER.Phone", "USER.Position", "USER.Department",
                            "USER.LastInventoried", "USER.Location", "USER.ZOPMProfile", "USER.ZOPMUpdateTime"}) {
        EXPECT_EQ(stored(key), "") << key;
    }
    EXPECT_FALSE(isLogged(writingFailed));
}

TEST_F(AssetModificationTest, AFailureToOpenTheFileIsOnlyLogged) {
    blockData(assetFile);
    modify({named("AssetNumber", text("A-2"))});
    EXPECT_TRUE(isLogged(writingFailed));
    EXPECT_THAT(loggedFailures(), IsEmpty()) << "the failure is not logged as an error";
    EXPECT_TRUE(fs::is_directory(dataFile(assetFile)));
    EXPECT_EQ(property("AssetNumber"), "(none)");
}

TEST_F(AssetModificationTest, AFileThatCanBeReadButNotReplacedKeepsItsContent) {
    // A file in procfs can be opened for writing, but no temporary file can be created in its directory.
    fs::create_symlink("/proc/self/oom_score_adj", dataFile(assetFile));
    ASSERT_EQ(property("AssetNumber"), "\"\"");
    modify({named("AssetNumber", text("A-2"))});
    EXPECT_TRUE(isLogged(writingFailed));
    EXPECT_THAT(loggedFailures(), IsEmpty());
    EXPECT_EQ(property("AssetNumber"), "\"\"");
}

TEST_F(AssetModificationTest, TheNextModificationAfterAFailureIsWritten) {
    blockData(assetFile);
    modify({named("AssetNumber", text("A-2"))});
    freeData(assetFile);
    modify({named("AssetNumber", text("A-3"))});
    EXPECT_EQ(stored("USER.AssetNumber"), "A-3");
}

TEST_F(AssetModificationTest, NoTemporaryFileRemains) {
    modify({named("AssetNumber", text("A-2"))});
    std::vector<std::string> files;
    for (const auto& entry : fs::directory_iterator(agentEnvironment::dataDirectory())) {
        files.push_back(entry.path().filename());
    }
    EXPECT_THAT(files, ElementsAre(assetFile));
}

}  // namespace
}  // namespace contract
