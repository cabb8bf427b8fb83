#include <gtest/gtest.h>

#include "framework/PropertyText.h"

using KO::PropertyText;

namespace {

/** Writes and reads a property file with one entry. Returns the value of the key. */
std::string roundTrip(const std::string& key, const std::string& value) {
    PropertyText written;
    written.set("before", "1");
    written.set(key, value);
    written.set("after", "2");
    const PropertyText read(written.text());
    EXPECT_EQ(read.get("before"), "1");
    EXPECT_EQ(read.get("after"), "2");
    return read.get(key).value_or("(absent)");
}

}  // namespace

TEST(PropertyText, HasAValueForEachKey) {
    const PropertyText text("USER.Name=Ann\nUSER.Phone=123\n");
    EXPECT_EQ(text.get("USER.Name"), "Ann");
    EXPECT_EQ(text.get("USER.Phone"), "123");
    EXPECT_EQ(text.get("user.name"), std::nullopt);
    EXPECT_EQ(text.get(""), std::nullopt);
}

TEST(PropertyText, MayBeWrittenByHand) {
    const PropertyText text("  # a comment = no entry\r\n\n Key = some text \r\nno entry\n=nameless\nlast=line");
    EXPECT_EQ(text.get("Key"), "some text");
    EXPECT_EQ(text.get("last"), "line");
    EXPECT_EQ(text.get(""), "nameless");
    EXPECT_EQ(text.get("# a comment"), std::nullopt);
    EXPECT_EQ(text.get("no entry"), std::nullopt);
}

TEST(PropertyText, ReadsTheFirstOfTwoEntriesOfAKey) {
    PropertyText text("a=1\na=2\n");
    EXPECT_EQ(text.get("a"), "1");
    text.set("a", "3");
    EXPECT_EQ(text.text(), "a=3\na=2\n");
}

TEST(PropertyText, KeepsOrderCommentsAndOtherEntries) {
    PropertyText text("# head\n\nb = 1 \r\nstray\na=\\q\n");
    text.set("c", "3");
    text.set("a", "2");
    EXPECT_EQ(text.text(), "# head\n\nb = 1 \r\nstray\na=2\nc=3\n");
}

TEST(PropertyText, KeepsEveryByteOfAValue) {
    std::string everyByte;
    for (int byte = 255; byte >= 0; --byte) {
        everyByte += static_cast<char>(byte);
    }
    EXPECT_EQ(roundTrip("key", everyByte), everyByte);
    for (const std::string value :
         {"", " ", "  two  ", "\t", "a\nb=c\n# d", "\\", "\\n", "\\x41", "trailing\\", "=", "#"}) {
        EXPECT_EQ(roundTrip("key", value), value);
    }
}

TEST(PropertyText, KeepsEveryByteOfAKey) {
    std::string everyByte;
    for (int byte = 0; byte < 256; ++byte) {
        everyByte += static_cast<char>(byte);
    }
    EXPECT_EQ(roundTrip(everyByte, "value"), "value");
    for (const std::string key : {"", " ", "#", "a=b", "\\", "\\=", "#x", " #"}) {
        EXPECT_EQ(roundTrip(key, "value"), "value") << key;
    }
}

TEST(PropertyText, WritesReadableEscapes) {
    PropertyText text;
    text.set("a=b #1", " line 1\nline\t2\\ ");
    EXPECT_EQ(text.text(), "a\\x3Db \\x231=\\x20line 1\\nline\\x092\\\\\\x20\n");
}

TEST(PropertyText, KeepsABackslashBeforeOtherCharacters) {
    const PropertyText text("a=\\q\nb=\\x4\nc=\\x4g\nd=C:\\dir\\\n");
    EXPECT_EQ(text.get("a"), "\\q");
    EXPECT_EQ(text.get("b"), "\\x4");
    EXPECT_EQ(text.get("c"), "\\x4g");
    EXPECT_EQ(text.get("d"), "C:\\dir\\");
}
