// Changing and writing the asset data.

#include <gmock/gmock.h>

#include "AssetSupport.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

struct TextSetter {
    const char* name;
    void (AssetIDDetails::*set)(const std::string&);
    std::size_t getter;  ///< index in stringGetters or dateGetters
};

const TextSetter textSetters[] = {
    {"setAssetNumber", &AssetIDDetails::setAssetNumber, 0},
    {"setOwnerName", &AssetIDDetails::setOwnerName, 2},
    {"setOwnerPhone", &AssetIDDetails::setOwnerPhone, 3},
    {"setOwnerPosition", &AssetIDDetails::setOwnerPosition, 4},
    {"setOwnerDepartment", &AssetIDDetails::setOwnerDepartment, 5},
    {"setSystemLocation", &AssetIDDetails::setSystemLocation, 6},
    {"setZOPMProfile", &AssetIDDetails::setZOPMProfile, 7},
};
const TextSetter dateSetters[] = {
    {"setLastInventoried", &AssetIDDetails::setLastInventoried, 0},
    {"setSystemPurchaseDate", &AssetIDDetails::setSystemPurchaseDate, 1},
    {"setZOPMUpdateTime", &AssetIDDetails::setZOPMUpdateTime, 2},
};

/** Returns the eleven fixed entries, with a value for one of them. */
std::string fixedEntries(const std::string& key = {}, const std::string& value = {}) {
    std::string content;
    for (const char* each :
         {"USER.AssetNumber", "USER.AssetIdTag", "USER.Name", "USER.Phone", "USER.Position", "USER.Department",
          "USER.LastInventoried", "USER.PurchaseDate", "USER.Location", "USER.ZOPMProfile", "USER.ZOPMUpdateTime"}) {
        content += std::string(each) + "=" + (key == each ? value : "") + "\n";
    }
    return content;
}

std::string pairEntries(const Pairs& pairs) {
    std::string content;
    for (std::size_t index = 0; index < pairs.size(); ++index) {
        const std::string number = std::to_string(index + 1);
        content += "USER.PersonalizedLabel" + number + "=" + pairs[index].first + "\n";
        content += "USER.PersonalizedData" + number + "=" + pairs[index].second + "\n";
    }
    return content;
}

using AssetFlush = AssetFile;

TEST_F(AssetFlush, WritesTheFixedKeysAndThenThePairsInOrder) {
    AssetIDDetails().flushAssetData();
    EXPECT_EQ(file(), fixedEntries() + pairEntries(Pairs(5, {"Null", "Null"})));
}

TEST_F(AssetFlush, WritesEachChangedStringWithItsKey) {
    for (const TextSetter& setter : textSetters) {
        SCOPED_TRACE(setter.name);
        std::filesystem::remove(path());
        AssetIDDetails element;
        (element.*setter.set)("new text");
        const TextGetter& getter = stringGetters[setter.getter];
        EXPECT_EQ(valueOf(element, getter), "new text");
        EXPECT_EQ(file(), "") << "nothing is written before flushAssetData()";
        element.setPersonalizedData({});
        element.flushAssetData();
        EXPECT_EQ(file(), fixedEntries(getter.key, "new text"));
        EXPECT_EQ(valueOf(AssetIDDetails(), getter), "new text");
    }
}

TEST_F(AssetFlush, WritesEachChangedDateWithItsKey) {
    for (const TextSetter& setter : dateSetters) {
        SCOPED_TRACE(setter.name);
        std::filesystem::remove(path());
        AssetIDDetails element;
        (element.*setter.set)(someDate);
        const TextGetter& getter = dateGetters[setter.getter];
        EXPECT_EQ(valueOf(element, getter), someDate);
        element.setPersonalizedData({});
        element.flushAssetData();
        EXPECT_EQ(file(), fixedEntries(getter.key, someDate));
        EXPECT_EQ(valueOf(AssetIDDetails(), getter), someDate);
    }
}

TEST_F(AssetFlush, WritesAnInvalidDateAsUnset) {
    AssetIDDetails element;
    for (const char* text : {"", "yesterday", noDate, "20241399000000.000000+000"}) {
        element.setLastInventoried(someDate);
        element.setLastInventoried(text);
        EXPECT_EQ(valueOf(element, dateGetters[0]), noDate) << text;
    }
}

TEST_F(AssetFlush, ReturnsTheProfileAndItsTimeFromBothGetters) {
    AssetIDDetails element;
    element.setZOPMProfile("profile");
    element.setZOPMUpdateTime(someDate);
    std::string text;
    EXPECT_TRUE(element.getDeploymentProfile(text));
    EXPECT_EQ(text, "profile");
    EXPECT_TRUE(element.getDeploymentUpdateTime(text));
    EXPECT_EQ(text, someDate);
}

TEST_F(AssetFlush, KeepsTheAssetTag) {
    write(path(), "USER.AssetIdTag=TAG-1\n");
    AssetIDDetails element;
    element.setAssetNumber("A-1");
    element.flushAssetData();
    const AssetIDDetails reread;
    EXPECT_EQ(valueOf(reread, stringGetters[1]), "TAG-1");
    EXPECT_EQ(valueOf(reread, stringGetters[0]), "A-1");
}

TEST_F(AssetFlush, KeepsUnknownKeys) {
    write(path(), "# by hand\nOTHER.Key=kept\nUSER.Name=Anna\nUSER.PersonalizedLabel6=six\n");
    AssetIDDetails element;
    element.setOwnerName("Berta");
    element.setPersonalizedData({});
    element.flushAssetData();
    const std::string content = file();
    EXPECT_EQ(content.substr(0, content.find("USER.AssetNumber")),
              "# by hand\nOTHER.Key=kept\nUSER.Name=Berta\nUSER.PersonalizedLabel6=six\n");
}

TEST_F(AssetFlush, OverwritesExternalChangesToTheFileWithTheSnapshot) {
    write(path(), "USER.Name=Anna\nUSER.Phone=1\n");
    AssetIDDetails element;
    write(path(), "USER.Name=Berta\nUSER.Phone=2\n");
    element.setOwnerPhone("3");
    element.flushAssetData();
    const AssetIDDetails reread;
    EXPECT_EQ(valueOf(reread, stringGetters[2]), "Anna");
    EXPECT_EQ(valueOf(reread, stringGetters[3]), "3");
}

TEST_F(AssetFlush, WritesTheSetPairsAndKeepsTheOthers) {
    const Pairs before = {{"l1", "d1"}, {"l2", "d2"}, {"l3", "d3"}, {"l4", "d4"}, {"l5", "d5"}};
    write(path(), fixedEntries() + pairEntries(before));
    AssetIDDetails element;
    element.setPersonalizedData({{"a", "b"}, {"", "d"}, {"e", ""}});
    element.flushAssetData();
    EXPECT_EQ(file(), fixedEntries() + pairEntries({{"a", "b"}, {"", "d"}, {"e", ""}, {"l4", "d4"}, {"l5", "d5"}}));
}

TEST_F(AssetFlush, WritesNoPairBeyondTheFifth) {
    AssetIDDetails element;
    const Pairs seven = {{"1", "a"}, {"2", "b"}, {"3", "c"}, {"4", "d"}, {"5", "e"}, {"6", "f"}, {"7", "g"}};
    element.setPersonalizedData(seven);
    EXPECT_EQ(pairsOf(element), seven);
    element.flushAssetData();
    EXPECT_EQ(file(), fixedEntries() + pairEntries(Pairs(seven.begin(), seven.begin() + 5)));
}

TEST_F(AssetFlush, WritesNoPairsWhenThereAreNone) {
    AssetIDDetails element;
    element.setPersonalizedData({});
    EXPECT_EQ(pairsOf(element), Pairs());
    element.flushAssetData();
    EXPECT_EQ(file(), fixedEntries());
}

TEST_F(AssetFlush, KeepsAnyStringExactly) {
    for (const std::string& text : {std::string("Anna = Berta"), std::string("  blanks  "), std::string("two\nlines\r"),
                                    std::string("M\xC3\xBCller \\n # \\"), std::string(5000, 'x')}) {
        AssetIDDetails element;
        element.setOwnerName(text);
        element.setPersonalizedData({{text, text}});
        element.flushAssetData();
        const AssetIDDetails reread;
        EXPECT_EQ(valueOf(reread, stringGetters[2]), text);
        EXPECT_EQ(pairsOf(reread)[0], (AssetIDDetails::PersonalizedPair{text, text}));
    }
}

TEST_F(AssetFlush, IsNotCalledByTheDestructor) {
    {
        AssetIDDetails element;
        element.setOwnerName("Anna");
    }
    EXPECT_EQ(file(), "");
}

TEST_F(AssetFlush, CreatesAMissingFile) {
    AssetIDDetails element;
    std::filesystem::remove(path());
    element.setPersonalizedData({});
    element.flushAssetData();
    EXPECT_EQ(file(), fixedEntries());
}

TEST_F(AssetFlush, OnlyLogsFailures) {
    AssetIDDetails element;
    blockWithDirectory(path());
    agentEnvironment::forgetLog();
    element.setOwnerName("Anna");
    element.flushAssetData();
    EXPECT_THAT(logMessagesOf("AssetIDDetails.cpp", "flushAssetData"),
                ElementsAre(entering("flushAssetData", "AssetIDDetails.cpp"),
                            message("Throwing Exception while writing Data", "AssetIDDetails.cpp"),
                            exiting("flushAssetData", "AssetIDDetails.cpp")));
    for (const LogRecord& record : recordsOf("AssetIDDetails.cpp", "flushAssetData")) {
        EXPECT_EQ(record.level, 4000);
    }
    EXPECT_EQ(valueOf(element, stringGetters[2]), "Anna") << "the snapshot is kept";
}

TEST_F(AssetFlush, WritesEmptyValuesAfterAFailedRead) {
    blockWithDirectory(path());
    AssetIDDetails element;
    std::filesystem::remove(path());
    element.setOwnerName("Anna");
    element.flushAssetData();
    EXPECT_EQ(file(), fixedEntries("USER.Name", "Anna"));
}

}  // namespace
