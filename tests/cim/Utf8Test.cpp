#include <gtest/gtest.h>

#include <ostream>

#include "cim/Utf8.h"

using cim::firstCharacter;
using cim::Utf8Character;

namespace {

struct Case {
    const char* description;
    std::string_view text;
    std::uint32_t codePoint;
    std::size_t length;
    bool valid;
};

std::ostream& operator<<(std::ostream& stream, const Case& one) {
    return stream << one.description;
}

class Utf8Decoding : public testing::TestWithParam<Case> {};

TEST_P(Utf8Decoding, DecodesTheFirstCharacter) {
    const Case& expected = GetParam();
    const Utf8Character character = firstCharacter(expected.text);
    EXPECT_EQ(character.codePoint, expected.codePoint) << expected.description;
    EXPECT_EQ(character.length, expected.length) << expected.description;
    EXPECT_EQ(character.valid, expected.valid) << expected.description;
}

INSTANTIATE_TEST_SUITE_P(
    Utf8, Utf8Decoding,
    testing::Values(Case{"ASCII", "a", 'a', 1, true}, Case{"NUL", std::string_view("\0b", 2), 0, 1, true},
                    Case{"two bytes", "\xC3\xA9!", 0xE9, 2, true}, Case{"three bytes", "\xE2\x82\xAC", 0x20AC, 3, true},
                    Case{"four bytes", "\xF0\x9F\x98\x80", 0x1F600, 4, true},
                    Case{"the last code point", "\xF4\x8F\xBF\xBF", 0x10FFFF, 4, true},
                    Case{"beyond the last", "\xF4\x90\x80\x80", 0xF4, 1, false},
                    Case{"a continuation alone", "\x80", 0x80, 1, false},
                    Case{"overlong slash", "\xC0\xAF", 0xC0, 1, false},
                    Case{"overlong three bytes", "\xE0\x80\xAF", 0xE0, 1, false},
                    Case{"a surrogate", "\xED\xA0\x80", 0xED, 1, false}, Case{"cut off", "\xE2\x82", 0xE2, 1, false},
                    Case{"truncated", "\xE2\x82x", 0xE2, 1, false},
                    Case{"never a first byte", "\xFF", 0xFF, 1, false}));

TEST(Utf8, DecodingRevertsEncoding) {
    for (const std::uint32_t codePoint :
         {0x00U, 0x7FU, 0x80U, 0x7FFU, 0x800U, 0xD7FFU, 0xE000U, 0xFFFFU, 0x10000U, 0x10FFFFU}) {
        std::string bytes;
        cim::appendUtf8(bytes, codePoint);
        const Utf8Character character = firstCharacter(bytes + "next");
        EXPECT_TRUE(character.valid) << codePoint;
        EXPECT_EQ(character.codePoint, codePoint);
        EXPECT_EQ(character.length, bytes.size());
    }
}

TEST(Utf8, HasNoSurrogatesAndEndsAtPlaneSixteen) {
    for (const std::uint32_t number : {0xD800U, 0xDFFFU, 0x110000U, 0xFFFFFFFFU}) {
        EXPECT_FALSE(cim::isCodePoint(number)) << number;
    }
    EXPECT_TRUE(cim::isCodePoint(0xD7FF));
    EXPECT_TRUE(cim::isCodePoint(0x10FFFF));
}

TEST(Utf8, FindsTheFirstInvalidCharacter) {
    EXPECT_EQ(cim::findInvalidUtf8(""), std::string_view::npos);
    EXPECT_EQ(cim::findInvalidUtf8("a\xC3\xA9\xE2\x82\xAC"), std::string_view::npos);
    EXPECT_EQ(cim::findInvalidUtf8("a\xC3\xA9\xE2\x82"), 3U);
}

TEST(Utf8, ReplacesInvalidBytes) {
    struct {
        const char* bytes;
        const char* replaced;
    } const cases[] = {
        {"", ""},
        {"a\xC3\xA9\xE2\x82\xAC", "a\xC3\xA9\xE2\x82\xAC"},
        {"a\xFF\xC0\x80z", "a\uFFFD\uFFFD\uFFFDz"},
        {"\xE2\x82z", "\uFFFDz"},                            // truncated
        {"\xED\xA0\x80z", "\uFFFD\uFFFD\uFFFDz"},            // a surrogate
        {"\xE0\x80\x80z", "\uFFFD\uFFFD\uFFFDz"},            // overlong
        {"\xF4\x90\x80\x80z", "\uFFFD\uFFFD\uFFFD\uFFFDz"},  // beyond the last character
        {"z\xF0\x9F\x98", "z\uFFFD"},
        {"z\xF0\x9F", "z\uFFFD"},
    };
    for (const auto& each : cases) {
        EXPECT_EQ(cim::replaceInvalidUtf8(each.bytes), each.replaced);
    }
}

}  // namespace
