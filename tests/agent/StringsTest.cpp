#include <gtest/gtest.h>

#include "KO/Strings.h"

using KO::make_string;
using KO::make_wstring;

TEST(Strings, AreUtf8WhenNarrowAndCodePointsWhenWide) {
    EXPECT_EQ(make_wstring("aä€\xF0\x9F\x98\x80"), L"aä€\U0001F600");
    EXPECT_EQ(make_string(L"aä€\U0001F600"), "aä€\xF0\x9F\x98\x80");
    EXPECT_EQ(make_string(L"\u007f\u0080\u07ff\u0800\uffff\U00010000\U0010ffff"),
              "\x7f\xC2\x80\xDF\xBF\xE0\xA0\x80\xEF\xBF\xBF\xF0\x90\x80\x80\xF4\x8F\xBF\xBF");
}

TEST(Strings, KeepEmptyStringsAndNulCharacters) {
    EXPECT_EQ(make_wstring(""), L"");
    EXPECT_EQ(make_string(std::wstring()), "");
    EXPECT_EQ(make_wstring(std::string("a\0b", 3)), std::wstring(L"a\0b", 3));
    EXPECT_EQ(make_string(std::wstring(L"a\0b", 3)), std::string("a\0b", 3));
}

TEST(Strings, RoundTripInvalidUtf8) {
    std::string bytes;
    for (int byte = 0; byte < 256; ++byte) {
        bytes += static_cast<char>(byte);
    }
    for (const std::string& text : {bytes, std::string("caf\xE9"), std::string("\xED\xB2\x80"), std::string("\xE2\x82"),
                                    std::string("\xC0\x80\xF5\xFF")}) {
        EXPECT_EQ(make_string(make_wstring(text)), text);
    }
    EXPECT_EQ(make_wstring("caf\xE9").size(), 4U);
}

TEST(Strings, ReplaceInvalidCodePoints) {
    EXPECT_EQ(make_string(std::wstring(1, static_cast<wchar_t>(0xD800))), "\xEF\xBF\xBD");
    EXPECT_EQ(make_string(std::wstring(1, static_cast<wchar_t>(0x110000))), "\xEF\xBF\xBD");
    EXPECT_EQ(make_string(std::wstring(1, static_cast<wchar_t>(-1))), "\xEF\xBF\xBD");
}

TEST(Strings, CopyNarrowStrings) {
    EXPECT_EQ(make_string("/var/lib/"), "/var/lib/");
    EXPECT_EQ(make_string(static_cast<const char*>(nullptr)), "");
}
