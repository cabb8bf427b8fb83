// Log records of the asset element.

#include "AssetSupport.h"

#include <gmock/gmock.h>

namespace {

using namespace providerTest;
using testing::ElementsAre;

constexpr const char* source = "AssetIDDetails.cpp";

using AssetTrace = AssetFile;

TEST_F(AssetTrace, LogsTheFilePath) {
    const AssetIDDetails element;
    EXPECT_THAT(logMessagesOf(source, "getFileName"),
                ElementsAre(entering("getFileName", source),
                            message("Asset.dat file opened in write mode Successfully", source),
                            exiting("getFileName", source)));
}

TEST_F(AssetTrace, LogsTheValuesThatItReads) {
    write(path(),
          "USER.AssetNumber=A-1\nUSER.AssetIdTag=TAG\nUSER.Name=Anna\nUSER.Phone=1\nUSER.Position=P\n"
          "USER.Department=D\nUSER.Location=L\nUSER.ZOPMProfile=Z\nUSER.PersonalizedLabel2=two\n");
    const AssetIDDetails element;
    std::vector<std::string> expected = {
        entering("AssetIDDetails", source),          message("Opening File", source),
        message("File Locked successfully", source), message("File Open successfully", source),
        variable("_AssetNumber", "A-1", source),     variable("_AssetIdTag", "TAG", source),
        variable("_OwnerName", "Anna", source),      variable("_OwnerPhone", "1", source),
        variable("_OwnerPosition", "P", source),     variable("_OwnerDepartment", "D", source),
        variable("_SystemLocation", "L", source),    variable("_ZOPMProfile", "Z", source),
    };
    for (const char* label : {"Null", "two", "Null", "Null", "Null"}) {
        expected.push_back(variable("label", label, source));
        expected.push_back(variable("data", "Null", source));
    }
    expected.push_back(exiting("AssetIDDetails", source));
    EXPECT_EQ(logMessagesOf(source, "AssetIDDetails"), expected);
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
    EXPECT_EQ(lines[0], entering("getFileName", source));
    EXPECT_EQ(lines[2], exiting("getFileName", source));
    EXPECT_EQ(lines[3], entering("AssetIDDetails", source));
}

TEST_F(AssetTrace, LogsFiltersAtErrorLevel) {
    AssetIDDetails element;
    agentEnvironment::forgetLog();
    element.setFilter(AssetIDDetails::FILTER_NAME, "tight");
    EXPECT_THAT(logMessagesOf(source, "setFilter"),
                ElementsAre(entering("setFilter", source, " filterType=1 reference=tight"),
                            exiting("setFilter", source, " filterType=1 reference=tight")));
    for (const LogRecord& record : recordsOf(source, "setFilter")) {
        EXPECT_EQ(record.level, 3000);
    }
    for (const LogRecord& record : recordsOf(source, "evaluate")) {
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
        expected.push_back(entering(function, source));
        expected.push_back(exiting(function, source));
    }
    EXPECT_EQ(logMessages(), expected);
}

}  // namespace
