// Log records of the asset element.

#include <gmock/gmock.h>

#include "AssetSupport.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

constexpr const char* assetSource = "AssetIDDetails.cpp";

using AssetTrace = AssetFile;

TEST_F(AssetTrace, LogsTheCreationOfTheFile) {
    const AssetIDDetails element;
    EXPECT_THAT(logMessagesOf(assetSource, "getFileName"),
                ElementsAre(entering("getFileName", assetSource),
                            message("Asset.dat file opened in write mode Successfully", assetSource),
                            exiting("getFileName", assetSource)));
}

TEST_F(AssetTrace, LogsTheValuesThatItReads) {
    write(path(),
          "USER.AssetNumber=A-1\nUSER.AssetIdTag=TAG\nUSER.Name=Anna\nUSER.Phone=1\nUSER.Position=P\n"
          "USER.Department=D\nUSER.Location=L\nUSER.ZOPMProfile=Z\nUSER.PersonalizedLabel2=two\n");
    const AssetIDDetails element;
    std::vector<std::string> expected = {
        entering("AssetIDDetails", assetSource),          message("Opening File", assetSource),
        message("File Locked successfully", assetSource), message("File Open successfully", assetSource),
        variable("_AssetNumber", "A-1", assetSource),     variable("_AssetIdTag", "TAG", assetSource),
        variable("_OwnerName", "Anna", assetSource),      variable("_OwnerPhone", "1", assetSource),
        variable("_OwnerPosition", "P", assetSource),     variable("_OwnerDepartment", "D", assetSource),
        variable("_SystemLocation", "L", assetSource),    variable("_ZOPMProfile", "Z", assetSource),
    };
    for (const char* label : {"Null", "two", "Null", "Null", "Null"}) {
        expected.push_back(variable("label", label, assetSource));
        expected.push_back(variable("data", "Null", assetSource));
    }
    expected.push_back(exiting("AssetIDDetails", assetSource));
    EXPECT_EQ(logMessagesOf(assetSource, "AssetIDDetails"), expected);
    for (const LogRecord& record : agentEnvironment::log()) {
        EXPECT_EQ(record.level, 4000);
        EXPECT_EQ(record.logger, "Tarvik.LeaseWarrantyProvider");
    }
    EXPECT_EQ(logMessages("log"), logMessages("trace"));
}

TEST_F(AssetTrace, CreatesTheFileBeforeItLogsItsConstruction) {
    const AssetIDDetails element;
    const auto lines = logMessages();
    ASSERT_GT(lines.size(), 4U);
    EXPECT_EQ(lines[0], entering("getFileName", assetSource));
    EXPECT_EQ(lines[2], exiting("getFileName", assetSource));
    EXPECT_EQ(lines[3], entering("AssetIDDetails", assetSource));
}

TEST_F(AssetTrace, LogsFiltersAtErrorLevel) {
    AssetIDDetails element;
    agentEnvironment::forgetLog();
    element.setFilter(AssetIDDetails::FILTER_NAME, "tight");
    EXPECT_THAT(logMessagesOf(assetSource, "setFilter"),
                ElementsAre(entering("setFilter", assetSource, " filterType=1 reference=tight"),
                            exiting("setFilter", assetSource, " filterType=1 reference=tight")));
    for (const LogRecord& record : recordsOf(assetSource, "setFilter")) {
        EXPECT_EQ(record.level, 3000);
    }
    for (const LogRecord& record : recordsOf(assetSource, "evaluate")) {
        EXPECT_EQ(record.level, 4000);
    }
}

TEST_F(AssetTrace, LogsEntryAndExitOfItsOperations) {
    AssetIDDetails element;
    agentEnvironment::forgetLog();
    EXPECT_TRUE(hasCurrent(element));
    ++element;
    std::string text;
    element.getAssetNumber(text);
    element.getDeploymentUpdateTime(text);
    element.setSystemPurchaseDate(someDate);
    element.setOwnerPhone("1");
    element.setPersonalizedData({});
    element.flushAssetData();
    element.getAssetIDStringArea();
    std::vector<std::string> expected;
    for (const char* function :
         {"operator bool", "operator++", "getAssetNumber", "getDeploymentUpdateTime", "setSystemPurchaseDate",
          "setOwnerPhone", "setPersonalizedData", "flushAssetData", "getAssetIDStringArea"}) {
        expected.push_back(entering(function, assetSource));
        expected.push_back(exiting(function, assetSource));
    }
    EXPECT_EQ(logMessages(), expected);
}

}  // namespace
