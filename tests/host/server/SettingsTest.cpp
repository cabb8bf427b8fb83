#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>

#include "server/Settings.h"
#include "support/Files.h"

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

    testsupport::TempDirectory directory;
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

TEST_F(SettingsTest, WithoutKeysOnlyRootMayWriteAndNoOtherUserRead) {
    const Settings settings = read("");
    EXPECT_THAT(settings.access.writers, ElementsAre("root"));
    EXPECT_TRUE(settings.access.readers.empty());
    EXPECT_TRUE(settings.authenticates);
    EXPECT_TRUE(settings.listeners.empty());
}

TEST_F(SettingsTest, ReadsAllTables) {
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
[limits]
connections = 7
head_seconds = 3
open_enumerations = 5
enumeration_results = 6
enumeration_seconds = 20
enumeration_default_seconds = 10
pull_objects = 8
response_results = 9
lists_at_work = 10
requests_at_work = 11
failure_milliseconds = 0
)");
    ASSERT_EQ(settings.listeners.size(), 2U);
    EXPECT_EQ(settings.listeners[0].url(), "http://127.0.0.1:5988");
    EXPECT_EQ(settings.listeners[1].url(), "https://0.0.0.0:5989");
    EXPECT_THAT(settings.access.readers, ElementsAre("alice", "@operators"));
    EXPECT_TRUE(settings.access.writers.empty());
    EXPECT_EQ(settings.certificate, "/c");
    EXPECT_EQ(settings.limits.connections, 7U);
    EXPECT_EQ(settings.limits.headTime.count(), 3);
    EXPECT_EQ(settings.limits.enumerations.open, 5U);
    EXPECT_EQ(settings.limits.enumerations.results, 6U);
    EXPECT_EQ(settings.limits.enumerations.longestTimeout.count(), 20);
    EXPECT_EQ(settings.limits.enumerations.timeout.count(), 10);
    EXPECT_EQ(settings.limits.enumerations.mostObjects, 8U);
    EXPECT_EQ(settings.limits.responseResults, 9U);
    EXPECT_EQ(settings.limits.listsAtWork, 10U);
    EXPECT_EQ(settings.limits.requestsAtWork, 11U);
    EXPECT_EQ(settings.limits.failureDelay.count(), 0);
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
