#include <gtest/gtest.h>

#include <string>

#include "logging/LogSettings.h"

using RZLog::Channel;
using RZLog::Levels;

TEST(Levels, AdmitErrorsByDefault) {
    const Levels levels;
    for (const Channel channel : {Channel::log, Channel::trace}) {
        EXPECT_TRUE(levels.admit(channel, "any", 3000));
        EXPECT_FALSE(levels.admit(channel, "any", 3001));
    }
}

TEST(Levels, AreSeparatePerChannel) {
    Levels levels;
    levels.setDefault({4000, 0});
    EXPECT_TRUE(levels.admit(Channel::log, "any", 4000));
    EXPECT_FALSE(levels.admit(Channel::trace, "any", 3000));
}

TEST(Levels, OfALoggerApplyToItsExactName) {
    Levels levels;
    ASSERT_TRUE(levels.set("Ostrel.One", {6000, 100}));
    EXPECT_TRUE(levels.admit(Channel::log, "Ostrel.One", 6000));
    EXPECT_FALSE(levels.admit(Channel::trace, "Ostrel.One", 3000));
    for (const char* other : {"Ostrel.one", "Ostrel.One.Two", "Ostrel.On", ""}) {
        EXPECT_FALSE(levels.admit(Channel::log, other, 6000)) << other;
        EXPECT_TRUE(levels.admit(Channel::trace, other, 3000)) << other;
    }
}

TEST(Levels, HaveAHighestOfAllChannelsAndLoggers) {
    Levels levels;
    EXPECT_EQ(levels.highest(), 3000);
    levels.setDefault({1, 4000});
    EXPECT_EQ(levels.highest(), 4000);
    ASSERT_TRUE(levels.set("Ostrel.One", {6000, 100}));
    EXPECT_EQ(levels.highest(), 6000);
}

TEST(Levels, HaveRoomForSixtyFourLoggersWithNamesOfModestLength) {
    Levels levels;
    EXPECT_FALSE(levels.set(std::string(128, 'x'), {}));
    EXPECT_TRUE(levels.set(std::string(127, 'x'), {9, 9}));
    for (int number = 1; number < 64; ++number) {
        EXPECT_TRUE(levels.set("logger" + std::to_string(number), {number, 0}));
    }
    EXPECT_FALSE(levels.set("one too many", {9, 9}));
    EXPECT_TRUE(levels.admit(Channel::log, std::string(127, 'x'), 9));
    EXPECT_FALSE(levels.admit(Channel::log, std::string(127, 'x'), 10));
    EXPECT_TRUE(levels.admit(Channel::log, "logger63", 63));
    EXPECT_FALSE(levels.admit(Channel::log, "logger63", 64));
}
