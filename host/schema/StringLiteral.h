#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

// String literals of MOF.

namespace cimhost {

/** The string in quotation marks, with MOF's escapes for quotation marks, backslashes and control characters. */
std::string inQuotes(std::string_view string);

/**
 * Replaces the escapes of a string literal with their characters. A \x escape is a UTF-16 code unit, and a surrogate
 * pair is one character.
 * @param content the literal without its quotation marks; the grammar has checked its escapes
 * @throws ValueError for an unpaired surrogate, and for a null character, which CMPI strings cannot contain
 */
std::string unescaped(std::string_view content);

/** The character of a UTF-8 string that consists of one character up to U+FFFF; none for other strings. */
std::optional<std::uint16_t> singleCharacter(std::string_view string);

}  // namespace cimhost
