#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <fstream>
#include <functional>
#include <utility>

#include "server/Settings.h"
#include "support/TemporaryDirectory.h"

using namespace cimhost::server;
using testing::ElementsAre;
using testing::HasSubstr;

namespace {

class SettingsTest : public testing::Test {
protected:
    Settings read(const std::string& toml) {
        std::ofstream(file) << toml;
        return readSettings(file);
    }

    std::string reasonFor(const std::string& toml) {
        try {
            read(toml);
        } catch (const SettingsError& error) {
            return error.what();
        }
        return "accepted";
    }

    testsupport::TemporaryDirectory directory;
    const std::string file = directory.withSlash() + "cimhost.toml";
};

std::string refusalOf(const Settings& settings) {
    try {
        checkSettings(settings);
    } catch (const SettingsError& error) {
        return error.what();
    }
    return "accepted";
}

TEST_F(SettingsTest, WithoutKeysOnlyRootHasAccess) {
    const Settings settings = read("");
    EXPECT_THAT(settings.access.writers, ElementsAre("root"));
    EXPECT_TRUE(settings.access.readers.empty());
    EXPECT_TRUE(settings.authenticates);
    EXPECT_TRUE(settings.listeners.empty());
}

TEST_F(SettingsTest, ReadsTheTablesBesidesTheLimits) {
    const Settings settings = read(R"(
access_log = "/var/log/cimhost.log"
[[listen]]
[[listen]]
address = "0.0.0.0"
tls = true
[tls]
certificate = "/c"
key = "/k"
[access]
readers = ["alice", "@operators"]
writers = []
)");
    ASSERT_EQ(settings.listeners.size(), 2U);
    EXPECT_EQ(settings.listeners[0].url(), "http://127.0.0.1:5988");
    EXPECT_EQ(settings.listeners[1].url(), "https://0.0.0.0:5989");
    EXPECT_THAT(settings.access.readers, ElementsAre("alice", "@operators"));
    EXPECT_TRUE(settings.access.writers.empty());
    EXPECT_EQ(settings.certificate, "/c");
}

TEST_F(SettingsTest, EachKeyOfTheLimitsSetsItsOwnLimit) {
    const std::vector<std::pair<std::string, std::function<std::int64_t(const Limits&)>>> keys{
        {"connections", [](const Limits& limits) { return limits.connections; }},
        {"connections_per_address", [](const Limits& limits) { return limits.connectionsPerAddress; }},
        {"running_lists", [](const Limits& limits) { return limits.runningLists; }},
        {"running_requests", [](const Limits& limits) { return limits.runningRequests; }},
        {"queue_seconds", [](const Limits& limits) { return limits.queueTime.count(); }},
        {"response_results", [](const Limits& limits) { return limits.responseResults; }},
        {"request_bytes", [](const Limits& limits) { return limits.requestBytes; }},
        {"xml_depth", [](const Limits& limits) { return limits.xmlDepth; }},
        {"xml_elements", [](const Limits& limits) { return limits.xmlElements; }},
        {"open_enumerations", [](const Limits& limits) { return limits.enumerations.open; }},
        {"enumeration_results", [](const Limits& limits) { return limits.enumerations.results; }},
        {"enumeration_seconds", [](const Limits& limits) { return limits.enumerations.longestTimeout.count(); }},
        {"enumeration_default_seconds", [](const Limits& limits) { return limits.enumerations.timeout.count(); }},
        {"pull_objects", [](const Limits& limits) { return limits.enumerations.mostObjects; }},
        {"head_seconds", [](const Limits& limits) { return limits.headTime.count(); }},
        {"body_seconds", [](const Limits& limits) { return limits.bodyTime.count(); }},
        {"response_seconds", [](const Limits& limits) { return limits.responseTime.count(); }},
        {"idle_seconds", [](const Limits& limits) { return limits.idleTime.count(); }},
        {"stop_seconds", [](const Limits& limits) { return limits.stopTime.count(); }},
        {"failure_milliseconds", [](const Limits& limits) { return limits.failureDelay.count(); }}};
    std::string toml = "[limits]\n";
    for (std::size_t i = 0; i < keys.size(); ++i) {
        toml += keys[i].first + " = " + std::to_string(100 + i) + "\n";
    }
    const Limits limits = read(toml).limits;
    for (std::size_t i = 0; i < keys.size(); ++i) {
        EXPECT_EQ(keys[i].second(limits), static_cast<std::int64_t>(100 + i)) << keys[i].first;
    }
}

TEST_F(SettingsTest, TheSizeOfHeadsHasALowerLimit) {
    EXPECT_EQ(read("[limits]\nhead_bytes = 5000").limits.headBytes, 5000U);
    EXPECT_THAT(reasonFor("[limits]\nhead_bytes = 100"), HasSubstr("limits.head_bytes must be an integer from 4096"));
}

TEST_F(SettingsTest, MistakesAreErrors) {
    EXPECT_THAT(reasonFor("[limits]\nconections = 7"), HasSubstr("limits.conections is unknown"));
    EXPECT_THAT(reasonFor("[limits]\nconnections = 0"), HasSubstr("limits.connections must be an integer"));
    EXPECT_THAT(reasonFor("[access]\nreaders = [1]"), HasSubstr("access.readers must be an array of strings"));
    EXPECT_THAT(reasonFor("[access]\nreaders = \"alice\""), HasSubstr("access.readers must be an array of strings"));
    EXPECT_THAT(reasonFor("[[listen]]\nport = 70000"), HasSubstr("port must be an integer from 0 to 65535"));
    EXPECT_THAT(reasonFor("x = "), HasSubstr("is not valid TOML"));
    EXPECT_THROW(readSettings(directory.withSlash() + "absent"), SettingsError);
}

TEST_F(SettingsTest, PasswordsAndOpenAccessStayOffTheNetwork) {
    Settings settings;
    settings.listeners = {{"127.0.0.1", 5988}, {"::1", 5988}};
    EXPECT_EQ(refusalOf(settings), "accepted");
    settings.authenticates = false;
    EXPECT_EQ(refusalOf(settings), "accepted");
    settings.listeners = {{"0.0.0.0", 5989, true}};
    EXPECT_THAT(refusalOf(settings), HasSubstr("without authentication on loopback addresses only"));
    settings.authenticates = true;
    EXPECT_THAT(refusalOf(settings), HasSubstr("TLS needs a certificate"));
    settings.certificate = settings.key = "/file";
    EXPECT_EQ(refusalOf(settings), "accepted");
    settings.listeners = {{"192.0.2.1", 5988}};
    EXPECT_THAT(refusalOf(settings), HasSubstr("passwords need TLS"));
}

}  // namespace
