// Reading the asset data file.

#include <algorithm>

#include "AssetSupport.h"
#include "KO/Mutex.h"

namespace {

using namespace providerTest;

const AssetIDDetails::PersonalizedPair nullPair{"Null", "Null"};

TEST_F(AssetFile, IsCreatedEmptyAndReadAsEmptyValues) {
    const AssetIDDetails element;
    ASSERT_TRUE(std::filesystem::is_regular_file(path()));
    EXPECT_EQ(file(), "");
    for (const TextGetter& getter : stringGetters) {
        EXPECT_EQ(valueOf(element, getter), "") << getter.name;
    }
    for (const TextGetter& getter : dateGetters) {
        EXPECT_EQ(valueOf(element, getter), noDate) << getter.name;
    }
    EXPECT_EQ(pairsOf(element), Pairs(5, nullPair));
}

TEST_F(AssetFile, ReturnsTheValueOfEachKey) {
    std::string content;
    for (const TextGetter& getter : stringGetters) {
        content += std::string(getter.key) + "=text of " + getter.key + "\n";
    }
    content +=
        "USER.LastInventoried=20240101000000.000000+000\nUSER.PurchaseDate=20250101000000.000000-300\n"
        "USER.ZOPMUpdateTime=20260101000000.000000+060\n";
    write(path(), content);
    const AssetIDDetails element;
    for (const TextGetter& getter : stringGetters) {
        EXPECT_EQ(valueOf(element, getter), std::string("text of ") + getter.key) << getter.name;
    }
    EXPECT_EQ(valueOf(element, dateGetters[0]), "20240101000000.000000+000");
    EXPECT_EQ(valueOf(element, dateGetters[1]), "20250101000000.000000-300");
    EXPECT_EQ(valueOf(element, dateGetters[2]), "20260101000000.000000+060");
    EXPECT_EQ(valueOf(element, dateGetters[3]), "20260101000000.000000+060");
}

TEST_F(AssetFile, ReturnsNullForMissingPersonalizedValues) {
    write(path(), "USER.PersonalizedLabel3=Cost centre\n");
    EXPECT_EQ(pairsOf(AssetIDDetails()), (Pairs{nullPair, nullPair, {"Cost centre", "Null"}, nullPair, nullPair}));
}

TEST_F(AssetFile, ReturnsTheFivePersonalizedPairsInOrder) {
    std::string content = "USER.PersonalizedLabel6=six\nUSER.PersonalizedData6=six\n";
    for (const char* number : {"5", "4", "3", "2", "1"}) {
        content += std::string("USER.PersonalizedData") + number + "=d" + number + "\n";
        content += std::string("USER.PersonalizedLabel") + number + "=l" + number + "\n";
    }
    write(path(), content);
    EXPECT_EQ(pairsOf(AssetIDDetails()), (Pairs{{"l1", "d1"}, {"l2", "d2"}, {"l3", "d3"}, {"l4", "d4"}, {"l5", "d5"}}));
}

TEST_F(AssetFile, ReturnsNullForEmptyPersonalizedValues) {
    write(path(),
          "USER.PersonalizedLabel1=\nUSER.PersonalizedData1=data\nUSER.PersonalizedLabel2=label\n"
          "USER.PersonalizedData2=\n");
    EXPECT_EQ(pairsOf(AssetIDDetails()), (Pairs{{"Null", "data"}, {"label", "Null"}, nullPair, nullPair, nullPair}));
}

TEST_F(AssetFile, ReturnsAnUnsetDateForAnInvalidDate) {
    write(path(), "USER.PurchaseDate=yesterday\nUSER.AssetNumber=A-1\n");
    const AssetIDDetails element;
    EXPECT_EQ(valueOf(element, dateGetters[1]), noDate);
    EXPECT_EQ(valueOf(element, stringGetters[0]), "A-1");
}

TEST_F(AssetFile, IsUnchangedByReading) {
    const std::string content = "# by hand\nUSER.Name = Anna \nOTHER=1\nnot a property\n";
    write(path(), content);
    EXPECT_EQ(valueOf(AssetIDDetails(), stringGetters[2]), "Anna");
    EXPECT_EQ(file(), content);
}

TEST_F(AssetFile, IsInTheDataDirectory) {
    AssetIDDetails element;
    std::filesystem::remove(path());
    EXPECT_EQ(std::filesystem::path(element.getFileName()), path());
    EXPECT_TRUE(std::filesystem::exists(path())) << "getFileName() creates the file";
}

TEST_F(AssetFile, IsUnchangedByGetFileName) {
    AssetIDDetails element;
    write(path(), "USER.Name=Anna\n");
    element.getFileName();
    EXPECT_EQ(file(), "USER.Name=Anna\n");
}

/** Expects the log records of a file that cannot be opened. */
void expectFailureLogged() {
    const auto creation = recordsOf("AssetIDDetails.cpp", "getFileName");
    ASSERT_EQ(creation.size(), 3U);
    EXPECT_EQ(withoutLine(creation[1].text),
              message("Failed while opening Asset.dat in write mode", "AssetIDDetails.cpp"));
    EXPECT_EQ(creation[1].level, 6000);
    const auto records = recordsOf("AssetIDDetails.cpp", "AssetIDDetails");
    const auto failure = std::find_if(records.begin(), records.end(), [](const LogRecord& record) {
        return withoutLine(record.text) == message("Throwing Exception in Constructor", "AssetIDDetails.cpp");
    });
    ASSERT_NE(failure, records.end());
    EXPECT_EQ(failure->level, 4000);
}

TEST_F(AssetFile, ProvidesNoValuesAndThrowsNothingIfItCannotBeOpened) {
    blockWithDirectory(path());
    const AssetIDDetails element;
    expectNothingStored(element);
    expectFailureLogged();
}

TEST_F(AssetFile, ProvidesNoValuesWithoutADataDirectory) {
    std::filesystem::remove_all(agentEnvironment::dataDirectory());
    const AssetIDDetails element;
    expectNothingStored(element);
    expectFailureLogged();
}

TEST_F(AssetFile, DoesNotAffectTheCursorIfItCannotBeOpened) {
    blockWithDirectory(path());
    AssetIDDetails element;
    std::string text;
    EXPECT_TRUE(hasCurrent(element));
    EXPECT_TRUE(element.getName(text));
    EXPECT_EQ(text, "spaced");
    element.setFilter(AssetIDDetails::FILTER_NAME, "tight");
    EXPECT_TRUE(element.getName(text));
    EXPECT_EQ(text, "tight");
}

TEST_F(AssetFile, IsReadAgainByTheNextElement) {
    blockWithDirectory(path());
    expectNothingStored(AssetIDDetails());
    std::filesystem::remove(path());
    write(path(), "USER.Name=Anna\n");
    EXPECT_EQ(valueOf(AssetIDDetails(), stringGetters[2]), "Anna");
}

TEST_F(AssetFile, IsReadOncePerElement) {
    write(path(), "USER.Name=Anna\n");
    const AssetIDDetails element;
    write(path(), "USER.Name=Berta\n");
    EXPECT_EQ(valueOf(element, stringGetters[2]), "Anna");
}

/** Expects that the lock is not held. */
void expectUnlocked() {
    EXPECT_NO_THROW(KO::_fileMutex.lock(0));
    KO::_fileMutex.unlock();
}

TEST_F(AssetFile, IsUnlockedAfterEachOperation) {
    AssetIDDetails element;
    expectUnlocked();
    element.flushAssetData();
    expectUnlocked();
    element.getFileName();
    expectUnlocked();
    blockWithDirectory(path());
    element.flushAssetData();
    expectUnlocked();
    const AssetIDDetails other;
    expectUnlocked();
}

}  // namespace
