#include <gtest/gtest.h>

#include <map>

#include "cim/Names.h"

TEST(CimNames, AreEqualInAnyLetterCase) {
    EXPECT_TRUE(cim::sameName("VELKO_Lease", "velko_LEASE"));
    EXPECT_TRUE(cim::sameName("", ""));
    EXPECT_FALSE(cim::sameName("VELKO_Lease", "VELKO_Leases"));
    EXPECT_FALSE(cim::sameName("VELKO_Lease", "VELKO-Lease"));
    EXPECT_FALSE(cim::sameName("@", "`")) << "only letters have a case";
    EXPECT_FALSE(cim::sameName("\xC3\x84", "\xC3\xA4")) << "only the letters A to Z have a case";
}

TEST(CimNames, AreCaseInsensitiveMapKeys) {
    std::map<std::string, int, cim::NameLess> numbers{{"Name", 1}, {"other", 2}};
    EXPECT_EQ(numbers.count("NAME"), 1U);
    EXPECT_EQ(numbers.begin()->first, "Name");
    EXPECT_EQ(cim::foldedName("VELKO_Lease1"), "velko_lease1");
}

TEST(CimNames, ConsistOfLettersDigitsAndUnderscores) {
    for (const char* name : {"a", "Z9", "_", "VELKO_Lease"}) {
        EXPECT_TRUE(cim::isName(name)) << name;
    }
    for (const char* string : {"", "9a", "a-b", "a b", "\xC3\xA4"}) {
        EXPECT_FALSE(cim::isName(string)) << string;
    }
}
