#include <gtest/gtest.h>

#include "cli/TextLayout.h"

// Characters that are wider or narrower than one column.

namespace cimhost::test {
namespace {

using text::columnsOf;

constexpr auto wide = "\u65E5\u672C";     // two letters of two columns each
constexpr auto accented = "e\u0301";      // a letter and the accent above it
constexpr auto composed = "\u00E9";       // the same in one
constexpr auto broken = "\xE6\x97 \xFF";  // an incomplete character, a blank, an invalid byte

TEST(Columns, AreThoseOfTheTerminal) {
    EXPECT_EQ(columnsOf(""), 0U);
    EXPECT_EQ(columnsOf("abc"), 3U);
    EXPECT_EQ(columnsOf(wide), 4U);
    EXPECT_EQ(columnsOf(accented), 1U);
    EXPECT_EQ(columnsOf(composed), 1U);
    EXPECT_EQ(columnsOf(broken), 4U);
    EXPECT_EQ(columnsOf(std::string(1, '\0')), 1U);
}

TEST(Columns, AreAlignedWithWideAndNarrowCharacters) {
    const std::vector<text::Row> rows{{wide, "1"}, {"abcd", "2"}, {accented, "3"}};
    EXPECT_EQ(text::aligned(rows, ""), std::string(wide) + "  1\nabcd  2\n" + accented + "     3\n");
}

TEST(Columns, OfAWindowAreNotExceededByWideLetters) {
    text::Style style;
    style.width = 24;
    std::string letters;
    for (int number = 0; number < 20; ++number) {
        letters += wide;
    }
    std::string put;
    const std::string shown = text::aligned({{"Name", letters}}, "", style);
    for (std::size_t begin = 0; begin < shown.size();) {
        const std::size_t end = shown.find('\n', begin);
        const std::string line = shown.substr(begin, end - begin);
        EXPECT_LE(columnsOf(line), 24U) << line;
        put += line.substr(line.find_first_not_of(' '));
        begin = end + 1;
    }
    EXPECT_EQ(put, "Name  " + letters);
}

}  // namespace
}  // namespace cimhost::test
