#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

// Layout of output for people: colours, columns, and lines that fit the terminal.

namespace cimhost {

/** Joins the strings that a function returns for the items, with the separator between them. */
template <class Item, class Function>
std::string joined(const std::vector<Item>& items, std::string_view separator, Function stringOf) {
    std::string list;
    for (const Item& item : items) {
        list += list.empty() ? "" : std::string(separator);
        list += stringOf(item);
    }
    return list;
}

inline std::string joined(const std::vector<std::string>& words, std::string_view separator) {
    return joined(words, separator, [](const std::string& word) -> const std::string& { return word; });
}

}  // namespace cimhost

namespace cimhost::text {

/** The values of --color. */
enum class Colours { automatic, always, never };

/** Style of output for people. */
struct Style {
    bool colours = false;
    std::size_t width = 0;  ///< columns of the terminal; 0: unlimited
};

/**
 * The style for a file descriptor. With Colours::automatic, a terminal has colours unless NO_COLOR is not empty or TERM
 * is "dumb". The width of a terminal is COLUMNS if that is a positive number, otherwise the reported width.
 */
Style styleFor(int descriptor, Colours mode);

/** The role of a string, which determines its colour. */
enum class Role { plain, heading, name, detail, alarm };

/** The string in the colour of its role, or unchanged if the style has no colours. */
std::string painted(const std::string& text, Role role, const Style& style);

/** Size of a character, or of a byte that is not UTF-8: in bytes, and in columns of a terminal. */
struct CharacterSize {
    std::size_t bytes;
    std::size_t columns;
};

/** The size of the first character of a UTF-8 string that is not empty. Most East Asian characters have two columns. */
CharacterSize sizeOfFirst(std::string_view text);

/** The columns of a string. */
std::size_t columnsOf(std::string_view text);

using Row = std::vector<std::string>;

/**
 * Aligns the columns of the rows. Lines that exceed the style's width continue below, in the last column; if there is
 * too little space for that, each cell is on a separate line.
 * @param roles roles of the first columns; other columns are plain
 */
std::string aligned(const std::vector<Row>& rows, const std::string& indent, const Style& style = {},
                    const std::vector<Role>& roles = {});

}  // namespace cimhost::text
