#pragma once

#include <cstddef>
#include <optional>
#include <string_view>

namespace Agent {

/** A place in a text and what is wrong there. */
struct Objection {
    std::size_t line;
    const char* reason;
};

/**
 * The first thing in a text for which it must not be given to the TOML parser, which would come to grief on it:
 * a character outside of ASCII where none may be or where a line's continuation begins, a string or bracket in the
 * middle of a number, or a key of very many parts.
 */
std::optional<Objection> objectionTo(std::string_view text);

}  // namespace Agent
