#pragma once

#include <utf8.h>

#include <cstddef>
#include <cstdint>
#include <iterator>
#include <string>
#include <string_view>

namespace cim {

/** A decoded character. */
struct Utf8Character {
    std::uint32_t codePoint;  ///< if not valid, the first byte
    std::size_t length;       ///< in bytes; 1 if not valid
    bool valid;               ///< whether the bytes are the UTF-8 encoding of a Unicode code point
};

/** Decodes the first character of a string that is not empty. Overlong forms and surrogates are not valid. */
inline Utf8Character firstCharacter(std::string_view string) {
    const auto first = static_cast<unsigned char>(string.front());
    if (first < 0x80) {
        return {first, 1, true};
    }
    const std::string_view head = string.substr(0, 4);
    if (utf8::find_invalid(head.begin(), head.end()) == head.begin()) {
        return {first, 1, false};
    }
    auto end = head.begin();
    const auto codePoint = static_cast<std::uint32_t>(utf8::unchecked::next(end));
    return {codePoint, static_cast<std::size_t>(end - head.begin()), true};
}

/** Whether a byte is a UTF-8 continuation byte. */
inline bool continuesCharacter(char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0U) == 0x80U;
}

/** Position of the first byte that is not part of valid UTF-8; std::string_view::npos if there is none. */
inline std::size_t findInvalidUtf8(std::string_view string) {
    const auto* const byte = utf8::find_invalid(string.begin(), string.end());
    return byte == string.end() ? std::string_view::npos : static_cast<std::size_t>(byte - string.begin());
}

/** Length of the invalid bytes at the front of a string: a truncated character, or one byte. */
inline std::size_t invalidLength(std::string_view string) {
    for (const std::size_t length : {3U, 2U}) {
        // Bytes are a truncated character if continuation bytes complete them to a valid one.
        const std::string completed = std::string(string.substr(0, length)) + "\x80\x80";
        if (string.size() >= length && firstCharacter(completed).valid) {
            return length;
        }
    }
    return 1;
}

/** Replaces each truncated character and each other byte that is not part of a character by U+FFFD. */
inline std::string replaceInvalidUtf8(std::string_view string) {
    std::string replaced;
    while (!string.empty()) {
        const Utf8Character character = firstCharacter(string);
        const std::size_t length = character.valid ? character.length : invalidLength(string);
        replaced += character.valid ? string.substr(0, length) : "\uFFFD";
        string.remove_prefix(length);
    }
    return replaced;
}

/** Whether a number can be encoded in UTF-8: not a surrogate, and not above U+10FFFF. */
inline bool isCodePoint(std::uint32_t number) {
    return number <= 0x10FFFF && (number < 0xD800 || number > 0xDFFF);
}

/** Appends a character. @param codePoint a valid code point */
inline void appendUtf8(std::string& string, std::uint32_t codePoint) {
    utf8::unchecked::append(codePoint, std::back_inserter(string));
}

}  // namespace cim
