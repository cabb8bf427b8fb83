#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace Agent {

/** The character at the head of a text. */
struct Utf8Character {
    std::uint32_t codePoint;  ///< if not valid, the first byte
    std::size_t length;       ///< in bytes; 1 if not valid
    bool valid;               ///< whether the bytes are the UTF-8 of a Unicode code point
};

/** Decodes the head of a text that is not empty. Overlong forms and surrogates are not valid. */
Utf8Character firstCharacter(std::string_view text);

}  // namespace Agent
