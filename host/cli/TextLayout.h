#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

// How output for people is laid out: colours, columns, lines that fit the terminal.

namespace cimhost {

/** Joins the words with the separator. */
inline std::string joined(const std::vector<std::string>& words, std::string_view separator) {
    std::string text;
    for (const std::string& word : words) {
        text += text.empty() ? "" : std::string(separator);
        text += word;
    }
    return text;
}

}  // namespace cimhost

namespace cimhost::text {

/** Whether the user wants colours. */
enum class Colours { automatic, always, never };

/** How output for people may look. */
struct Style {
    bool colours = false;
    std::size_t width = 0;  ///< columns of the window; 0: as many as are needed
};

/**
 * What suits a descriptor. Automatic colours are for terminals, unless NO_COLOR is set or TERM is "dumb". Only a
 * terminal limits the width: to COLUMNS, or else to what the terminal says.
 */
Style styleFor(int descriptor, Colours mode);

/** What a text stands for, which decides its colour. */
enum class Role { plain, heading, name, detail, alarm };

/** The text in the colour of its role, or as it is when the style has no colours. */
std::string painted(const std::string& text, Role role, const Style& style);

/** A character of a text, or a byte that is none: the bytes that it has, and the columns that a terminal gives it. */
struct Character {
    std::size_t bytes;
    std::size_t columns;
};

/** The character at the front of a text in UTF-8 that is not empty. Of letters of East Asia most have two columns. */
Character firstCharacter(std::string_view text);

/** The columns of a whole text. */
std::size_t columnsOf(std::string_view text);

using Row = std::vector<std::string>;

/**
 * The rows with their columns under each other; nothing is filled up after the last column. What is too wide for the
 * style's width goes on below, under the last column; where there is no room for that, each cell has a line of its own.
 * @param roles of the columns, from the first; those left out are plain
 */
std::string aligned(const std::vector<Row>& rows, const std::string& indent, const Style& style = {},
                    const std::vector<Role>& roles = {});

}  // namespace cimhost::text
