#include <gtest/gtest.h>

#include "KO/Moniker.h"

using KO::Moniker;

namespace {

std::string nameOf(const Moniker& moniker) {
    std::string name = "(none)";
    moniker.getName(name);
    return name;
}

}  // namespace

TEST(Moniker, IsInitiallyEmptyWithoutASelectedKey) {
    Moniker moniker;
    std::string text = "kept";
    EXPECT_EQ(moniker.getKeyCount(), 0U);
    EXPECT_FALSE(moniker.selectKey(0));
    EXPECT_FALSE(moniker.getName(text));
    EXPECT_FALSE(moniker.getValue(text));
    EXPECT_EQ(text, "kept");
}

TEST(Moniker, ReturnsNameAndValueOfTheSelectedKey) {
    Moniker moniker;
    moniker.addKey("Name", "host1");
    moniker.addKey("Name", "");
    EXPECT_EQ(moniker.getKeyCount(), 2U);
    std::string name;
    std::string value = "x";
    ASSERT_TRUE(moniker.selectKey(1));
    EXPECT_TRUE(moniker.getName(name));
    EXPECT_TRUE(moniker.getValue(value));
    EXPECT_EQ(name, "Name");
    EXPECT_EQ(value, "");
}

TEST(Moniker, KeepsItsSelectionIfAnotherIsInvalid) {
    Moniker moniker;
    moniker.addKey("a", "1");
    moniker.selectKey(0);
    EXPECT_FALSE(moniker.selectKey(1));
    EXPECT_EQ(nameOf(moniker), "a");
}

TEST(Moniker, KeepsItsSelectionWhenKeysAreAdded) {
    Moniker moniker;
    moniker.addKey("a", "1");
    EXPECT_EQ(nameOf(moniker), "(none)");
    moniker.selectKey(0);
    moniker.addKey("b", "2");
    EXPECT_EQ(nameOf(moniker), "a");
}

TEST(Moniker, CopiesAreIndependentAndStartWithTheSelection) {
    Moniker original;
    original.addKey("a", "1");
    original.addKey("b", "2");
    original.selectKey(1);
    Moniker copy = original;
    EXPECT_EQ(nameOf(copy), "b");
    copy.addKey("c", "3");
    copy.selectKey(0);
    EXPECT_EQ(original.getKeyCount(), 2U);
    EXPECT_EQ(nameOf(original), "b");

    Moniker assigned;
    assigned = copy;
    EXPECT_EQ(assigned.getKeyCount(), 3U);
    EXPECT_EQ(nameOf(assigned), "a");
    const Moniker& same = assigned;
    assigned = same;
    EXPECT_EQ(assigned.getKeyCount(), 3U);
}
