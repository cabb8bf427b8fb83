#pragma once

#include <cstddef>
#include <string_view>

namespace cimhost::text {

/** A character of a text, or a byte that is none: the bytes that it has, and the columns that a terminal gives it. */
struct Character {
    std::size_t bytes;
    std::size_t columns;
};

/** The character at the front of a text in UTF-8 that is not empty. Of letters of East Asia most have two columns. */
Character firstCharacter(std::string_view text);

/** The columns of a whole text. */
std::size_t columnsOf(std::string_view text);

}  // namespace cimhost::text
