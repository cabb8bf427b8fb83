#include <gmock/gmock.h>

#include <map>
#include <set>

#include "RequestFixture.h"

namespace {

using namespace providerTest;
using testing::Contains;
using testing::ElementsAre;

using RequestTrace = RequestTest;

TEST_F(RequestTrace, IsEnclosedBySeparators) {
    enumerate("VELKO_Lease");
    const auto lines = logMessages();
    ASSERT_GT(lines.size(), 6U);
    EXPECT_EQ(lines[0], rule);
    EXPECT_EQ(lines[1], entering("LeaseAndWarranty_EnumInstances", entryFile));
    EXPECT_EQ(lines[2], variable("classId", "20", entryFile));
    const std::vector<std::string> work(lines.begin() + 3, lines.end() - 2);
    EXPECT_THAT(work, testing::Each(testing::Not(testing::HasSubstr(entryFile))));
    EXPECT_THAT(work, Contains(entering("LeaseBase", "LeaseBase.cpp")));
    EXPECT_EQ(lines[lines.size() - 2], exiting("LeaseAndWarranty_EnumInstances", entryFile));
    EXPECT_EQ(lines.back(), rule);
}

TEST_F(RequestTrace, IsWrittenLineByLineToTheLogAndTheTraceChannel) {
    LeaseBase::cache.table.push_back(LeaseUnit("L1"));
    LeaseBase::cache.recordCountLease = 1;
    agentEnvironment::forgetLog();
    enumerate("VELKO_Lease");
    const auto records = agentEnvironment::log();
    ASSERT_EQ(records.size() % 2, 0U);
    ASSERT_GT(records.size(), 20U);
    for (std::size_t index = 0; index < records.size(); index += 2) {
        const auto& log = records[index];
        const auto& trace = records[index + 1];
        ASSERT_EQ(log.channel, "log") << index;
        ASSERT_EQ(trace.channel, "trace") << index;
        ASSERT_EQ(log.text, trace.text) << index;
        ASSERT_EQ(log.function + log.file + log.logger, trace.function + trace.file + trace.logger) << index;
        ASSERT_EQ(log.line, trace.line) << index;
        ASSERT_EQ(log.level, trace.level) << index;
    }
}

TEST_F(RequestTrace, UsesTheLoggerOfEachSourceFile) {
    LeaseBase::cache.table.push_back(LeaseUnit("L1"));
    LeaseBase::cache.recordCountLease = 1;
    WarrantyBase::cache.table.push_back(WarrantyUnit("W1"));
    WarrantyBase::cache.recordCountWarranty = 1;
    for (const char* className : {"VELKO_Lease", "VELKO_Warranty", "VELKO_OstrelAgent", "VELKO_AssetIDDetails"}) {
        enumerate(className);
    }
    for (const char* associationClass : {"VELKO_LeaseSetting", "VELKO_WarrantySetting"}) {
        associate(associationClass);
    }
    std::map<std::string, std::set<std::string>> loggersOfUnits;
    for (const auto& record : agentEnvironment::log()) {
        loggersOfUnits[record.file].insert(record.logger);
    }
    std::map<std::string, std::set<std::string>> expected;
    for (const char* file : {"LeaseAndWarrantyProvider.cpp", "sdk/kolib/include/Trace.h", "LeaseBase.cpp",
                             "WarrantyBase.cpp", "Lease.cpp", "Warranty.cpp", "LeaseSetting.cpp", "WarrantySetting.cpp",
                             "CMPIComputerSystem.cpp", "CMPILeaseSetting.cpp", "CMPIWarrantySetting.cpp",
                             "CMPILease.cpp", "CMPIWarranty.cpp", "CMPIOstrelAgent.cpp", "CMPIAssetIDDetail.cpp"}) {
        expected[file] = {"Tarvik.LeaseAndWarrantyProvider"};
    }
    for (const char* file : {"OstrelAgent.cpp", "AssetIDDetails.cpp"}) {
        expected[file] = {"Tarvik.LeaseWarrantyProvider"};
    }
    EXPECT_EQ(loggersOfUnits, expected);
}

TEST_F(RequestTrace, LogsExceptionsAtErrorLevelAndTheExit) {
    get("VELKO_OstrelAgent", {textKey("Version", "another")});
    const auto failures = recordsOf(entryFile, "LeaseAndWarranty_GetInstance");
    ASSERT_FALSE(failures.empty());
    EXPECT_EQ(withoutLine(failures.back().text), message("Could not find specified Agent.", entryFile));
    EXPECT_EQ(failures.back().level, 3000);
    const auto lines = logMessages();
    EXPECT_EQ(lines[lines.size() - 2], exiting("LeaseAndWarranty_GetInstance", entryFile));
    EXPECT_EQ(lines.back(), rule);
}

TEST_F(RequestTrace, OfAnUnknownClassContainsNoFurtherLines) {
    enumerate("VELKO_Unheard");
    EXPECT_THAT(logMessages(), ElementsAre(rule, entering("LeaseAndWarranty_EnumInstances", entryFile),
                                           variable("classId", "0", entryFile),
                                           exiting("LeaseAndWarranty_EnumInstances", entryFile), rule));
}

}  // namespace
