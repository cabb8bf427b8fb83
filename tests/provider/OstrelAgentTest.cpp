#include <gmock/gmock.h>

#include "KO/Exceptions.h"
#include "OstrelAgent.h"
#include "Support.h"

/** Contains letters, to test case sensitivity. */
const char* const agentVersion = "4.2.0-Beta";

namespace {

using namespace providerTest;
using testing::ElementsAre;

using KO::InstrumentationException;
using KO::LeaseWarrantyProvider::OstrelAgent;

constexpr const char* sourceFile = "OstrelAgent.cpp";

class OstrelAgentElement : public CleanAgent {
protected:
    void SetUp() override {
        CleanAgent::SetUp();
        std::filesystem::remove_all(marker());
    }
    void TearDown() override {
        std::filesystem::remove_all(marker());
        CleanAgent::TearDown();
    }

    static std::filesystem::path marker() { return agentEnvironment::installDirectory() / "version.lv1"; }

    static std::string refusal(int type, const std::string& value) {
        OstrelAgent agent;
        return thrown<InstrumentationException>(
            [&] { agent.setFilter(static_cast<OstrelAgent::FilterType>(type), value); });
    }
};

TEST_F(OstrelAgentElement, DescribesTheAgentProduct) {
    const OstrelAgent agent;
    EXPECT_EQ(agent.getName(), "Test Agent");
    EXPECT_EQ(agent.getProductName(), "Test Agent");
    EXPECT_EQ(agent.getVersion(), "4.2.0-Beta");
    EXPECT_EQ(agent.getBuildNumber(), "77");
    EXPECT_EQ(agent.getIdentifyingNumber(), "ID-1");
    EXPECT_EQ(agent.getVendor(), "VEL");
    EXPECT_EQ(agent.getCaption(), "VEL Ostrel");
    EXPECT_EQ(agent.getDescription(), "VEL Ostrel");
    EXPECT_EQ(agent.getStatus(), "OK");
}

TEST_F(OstrelAgentElement, HasANameSuffixIfTheMarkerFileExists) {
    const OstrelAgent agent;
    write(marker(), "whatever");
    EXPECT_EQ(agent.getName(), "Test Agent Tarvik Agent");
    EXPECT_EQ(agent.getProductName(), "Test Agent Tarvik Agent");
    write(marker(), "");
    EXPECT_EQ(agent.getName(), "Test Agent Tarvik Agent");
    std::filesystem::remove(marker());
    EXPECT_EQ(agent.getName(), "Test Agent");
    EXPECT_EQ(agent.getProductName(), "Test Agent");
}

TEST_F(OstrelAgentElement, HasNoNameSuffixIfAFileWithAnotherNameExists) {
    const auto other = agentEnvironment::installDirectory() / "version.LV1";
    write(other, "");
    EXPECT_EQ(OstrelAgent().getName(), "Test Agent");
    std::filesystem::remove(other);
}

TEST_F(OstrelAgentElement, ExistsExactlyOnce) {
    OstrelAgent agent;
    EXPECT_TRUE(hasCurrent(agent));
    EXPECT_TRUE(hasCurrent(agent));
    ++agent;
    EXPECT_FALSE(hasCurrent(agent));
    ++agent;
    EXPECT_FALSE(hasCurrent(agent));
}

TEST_F(OstrelAgentElement, AcceptsItsOwnKeysAndRejectsOthers) {
    const std::pair<int, std::string> keys[] = {
        {0, "Test Agent"}, {1, "ID-1"}, {2, "Test Agent"}, {3, "VEL"}, {4, "4.2.0-Beta"}};
    for (const auto& [type, value] : keys) {
        SCOPED_TRACE(type);
        EXPECT_EQ(refusal(type, value), "");
        for (const std::string& other : {value + " ", " " + value, value + std::string(1, '\0'), value.substr(1),
                                         std::string(), std::string("another")}) {
            EXPECT_EQ(refusal(type, other), "Could not find specified Agent.") << other;
        }
    }
}

TEST_F(OstrelAgentElement, ComparesKeysCaseSensitively) {
    EXPECT_EQ(refusal(OstrelAgent::FILTER_VENDOR, "vel"), "Could not find specified Agent.");
    EXPECT_EQ(refusal(OstrelAgent::FILTER_NAME, "TEST AGENT"), "Could not find specified Agent.");
    EXPECT_EQ(refusal(OstrelAgent::FILTER_IDENTIFYING_NUMBER, "id-1"), "Could not find specified Agent.");
    EXPECT_EQ(refusal(OstrelAgent::FILTER_VERSION, "4.2.0-beta"), "Could not find specified Agent.");
}

TEST_F(OstrelAgentElement, ComparesNamesWithTheSuffixIfTheMarkerFileExists) {
    write(marker(), "");
    for (const int type : {OstrelAgent::FILTER_NAME, OstrelAgent::FILTER_PRODUCT_NAME}) {
        EXPECT_EQ(refusal(type, "Test Agent Tarvik Agent"), "");
        EXPECT_EQ(refusal(type, "Test Agent"), "Could not find specified Agent.");
    }
}

TEST_F(OstrelAgentElement, AcceptsAnyValueOfAnUnknownKey) {
    for (const int type : {7, 5, -1, 2147483647}) {
        EXPECT_EQ(refusal(type, "anything"), "") << type;
    }
}

TEST_F(OstrelAgentElement, IsUnchangedByFilters) {
    OstrelAgent agent;
    agent.setFilter(OstrelAgent::FILTER_VENDOR, "VEL");
    EXPECT_TRUE(hasCurrent(agent));
    EXPECT_THROW(agent.setFilter(OstrelAgent::FILTER_VENDOR, "other"), InstrumentationException);
    EXPECT_TRUE(hasCurrent(agent));
    agent.setFilter(static_cast<OstrelAgent::FilterType>(7), "other");
    EXPECT_TRUE(hasCurrent(agent));
    ++agent;
    agent.setFilter(OstrelAgent::FILTER_VENDOR, "VEL");
    EXPECT_FALSE(hasCurrent(agent));
}

TEST_F(OstrelAgentElement, LogsFiltersAtErrorLevel) {
    OstrelAgent agent;
    agentEnvironment::forgetLog();
    agent.setFilter(OstrelAgent::FILTER_VERSION, "4.2.0-Beta");
    EXPECT_THAT(logMessagesOf(sourceFile, "setFilter"),
                ElementsAre(entering("setFilter", sourceFile, "FilterType=4 key_value=4.2.0-Beta"),
                            exiting("setFilter", sourceFile, "FilterType=4 key_value=4.2.0-Beta")));
    for (const LogRecord& record : recordsOf(sourceFile, "setFilter")) {
        EXPECT_EQ(record.level, 3000);
        EXPECT_EQ(record.logger, "Tarvik.LeaseWarrantyProvider");
    }
}

TEST_F(OstrelAgentElement, LogsTheReasonOfAFailedFilterAndNoExit) {
    refusal(OstrelAgent::FILTER_VENDOR, "other");
    EXPECT_THAT(logMessagesOf(sourceFile, "setFilter"),
                ElementsAre(entering("setFilter", sourceFile, "FilterType=3 key_value=other"),
                            message("Could not find specified Agent.", sourceFile)));
    for (const LogRecord& record : recordsOf(sourceFile, "setFilter")) {
        EXPECT_EQ(record.level, 3000);
    }
}

TEST_F(OstrelAgentElement, LogsEntryAndExitOfItsOperations) {
    agentEnvironment::forgetLog();
    OstrelAgent agent;
    EXPECT_TRUE(hasCurrent(agent));
    ++agent;
    agent.getBuildNumber();
    std::vector<std::string> expected;
    for (const char* function : {"OstrelAgent", "operator bool", "operator++", "getBuildNumber"}) {
        expected.push_back(entering(function, sourceFile));
        expected.push_back(exiting(function, sourceFile));
    }
    EXPECT_EQ(logMessages("log"), expected);
    EXPECT_EQ(logMessages("trace"), expected);
    for (const LogRecord& record : agentEnvironment::log()) {
        EXPECT_EQ(record.level, 4000);
        EXPECT_EQ(record.logger, "Tarvik.LeaseWarrantyProvider");
    }
}

}  // namespace
