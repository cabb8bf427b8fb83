#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace cimhost {

/** The text in quotation marks, with MOF's escapes for quotation marks, backslashes and control characters. */
std::string inQuotes(std::string_view text);

/**
 * The text that a string literal stands for, given what is between its quotation marks. \x escapes are UTF-16
 * units, of which two may make one character. ValueError for half of such a pair and for a null character, be it
 * written as \x0 or as itself, which no provider could be given. Other escapes than MOF's must not be there.
 */
std::string unescaped(std::string_view content);

/** The text with a replacement character (U+FFFD) where its bytes are no UTF-8. */
std::string wellFormed(std::string_view text);

/** Adds the character in UTF-8. */
void appendUtf8(std::string& text, std::uint32_t codePoint);

/**
 * The single 16-bit character that the text is in UTF-8, in code.
 * @return false when it is none: empty, longer, outside 16 bits, or no UTF-8
 */
bool singleCharacter(std::string_view text, std::uint16_t& code);

/** Whether the text is a CIM datetime: a date that exists, or an interval; fields may be asterisks from the right. */
bool isDateTime(std::string_view text);

/** Whether the text is a time of nothing but zeros: no datetime, but sent to say that there is none. */
bool isNoDateTime(std::string_view text);

}  // namespace cimhost
