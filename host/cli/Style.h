#pragma once

#include <cstddef>
#include <string>

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
Style styleFor(int descriptor, Colours wish);

/** What a text stands for, which decides its colour. */
enum class Role { plain, heading, name, detail, alarm };

/** The text in the colour of its role, or as it is when the style has no colours. */
std::string painted(const std::string& text, Role role, const Style& style);

}  // namespace cimhost::text
