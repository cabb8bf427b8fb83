#include <gmock/gmock.h>

#include "agent/ShippedConfiguration.h"
#include "logging/LogSettings.h"

using RZLog::Channel;
using RZLog::LogSettings;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

class LogSettingsTest : public testing::Test {
protected:
    LogSettings read(const char* text) {
        const Agent::Document document = Agent::Document::parse(text, "test");
        EXPECT_EQ(document.problem(), "");
        return RZLog::readLogSettings(document, problems);
    }

    Agent::Problems problems;
};

TEST_F(LogSettingsTest, HaveDefaults) {
    const LogSettings settings = read("");
    EXPECT_EQ(settings.destination, LogSettings::Destination::none);
    EXPECT_EQ(settings.rotationSize, 10485760U);
    EXPECT_EQ(settings.rotationCount, 5U);
    EXPECT_TRUE(settings.levels.admit(Channel::log, "any", 3000));
    EXPECT_FALSE(settings.levels.admit(Channel::trace, "any", 4000));
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(LogSettingsTest, HaveTheDefaultsOfTheInstalledFile) {
    const LogSettings shown = read(shippedConfiguration().c_str());
    EXPECT_EQ(shown.destination, LogSettings::Destination::none);
    EXPECT_EQ(shown.rotationSize, 10485760U);
    EXPECT_EQ(shown.rotationCount, 5U);
    for (const Channel channel : {Channel::log, Channel::trace}) {
        EXPECT_TRUE(shown.levels.admit(channel, "any", 3000));
        EXPECT_FALSE(shown.levels.admit(channel, "any", 4000));
    }
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(LogSettingsTest, AcceptEveryDestination) {
    EXPECT_EQ(read("[log]\ndestination = 'none'").destination, LogSettings::Destination::none);
    EXPECT_EQ(read("[log]\ndestination = 'syslog'").destination, LogSettings::Destination::syslog);
    EXPECT_EQ(read("[log]\ndestination = 'journal'").destination, LogSettings::Destination::journal);
    const LogSettings settings = read("[log]\ndestination = '/var/log/agent.log'");
    EXPECT_EQ(settings.destination, LogSettings::Destination::file);
    EXPECT_EQ(settings.file, "/var/log/agent.log");
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(LogSettingsTest, RejectUnknownDestinations) {
    for (const char* text : {"[log]\ndestination = 'agent.log'", "[log]\ndestination = \"/a\\u0000b\""}) {
        problems.clear();
        EXPECT_EQ(read(text).destination, LogSettings::Destination::none);
        EXPECT_THAT(problems, ElementsAre("configuration key log.destination must be an absolute path, \"syslog\", "
                                          "\"journal\" or \"none\"; ignored"));
    }
}

TEST_F(LogSettingsTest, ReadRotation) {
    const LogSettings settings = read("[log]\nrotation_size = 5000\nrotation_count = 2\n");
    EXPECT_EQ(settings.rotationSize, 5000U);
    EXPECT_EQ(settings.rotationCount, 2U);
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(LogSettingsTest, UseTheGeneralLevelsForLevelsThatALoggerLacks) {
    const LogSettings settings =
        read("[log]\nlog_level = 4000\ntrace_level = 100\n[[log.logger]]\nname = 'one'\ntrace_level = 6000\n");
    EXPECT_TRUE(settings.levels.admit(Channel::log, "one", 4000));
    EXPECT_FALSE(settings.levels.admit(Channel::log, "one", 4001));
    EXPECT_TRUE(settings.levels.admit(Channel::trace, "one", 6000));
    EXPECT_FALSE(settings.levels.admit(Channel::trace, "two", 101));
    EXPECT_THAT(problems, IsEmpty());
}

TEST_F(LogSettingsTest, ReportProblems) {
    read("[log]\ncolour = 'red'\nlog_level = 'high'\nrotation_size = 1\n[[log.logger]]\nlevel = 1\n");
    EXPECT_THAT(problems,
                ElementsAre("configuration key log.rotation_size must be an integer from 4096 to 2147483647; "
                            "ignored",
                            "configuration key log.log_level must be an integer from 0 to 2147483647; ignored",
                            "configuration key log.logger[0].level is unknown; ignored",
                            "configuration key log.logger[0].name is missing; ignored",
                            "configuration key log.colour is unknown; ignored"));
}

}  // namespace
