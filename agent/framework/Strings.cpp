#include "KO/Strings.h"

#include <cstdint>

#include "cim/Utf8.h"

namespace KO {

namespace {

// A byte that is not UTF-8 becomes the lone surrogate 0xDC00 + byte, which no valid string contains.
constexpr std::uint32_t firstByteCarrier = 0xDC80;
constexpr std::uint32_t lastByteCarrier = 0xDCFF;
constexpr std::uint32_t byteCarrierBase = 0xDC00;
constexpr std::uint32_t replacementCharacter = 0xFFFD;

}  // namespace

std::string make_string(const std::wstring& text) {
    std::string narrow;
    narrow.reserve(text.size());
    for (const wchar_t element : text) {
        const auto number = std::uint32_t{std::char_traits<wchar_t>::to_int_type(element)};
        if (number >= firstByteCarrier && number <= lastByteCarrier) {
            narrow.push_back(static_cast<char>(number - byteCarrierBase));
        } else {
            cim::appendUtf8(narrow, cim::isCodePoint(number) ? number : replacementCharacter);
        }
    }
    return narrow;
}

std::string make_string(const char* text) {
    return text != nullptr ? text : "";
}

std::wstring make_wstring(const std::string& text) {
    std::wstring wide;
    wide.reserve(text.size());
    for (std::string_view rest = text; !rest.empty();) {
        const cim::Utf8Character character = cim::firstCharacter(rest);
        wide.push_back(
            static_cast<wchar_t>(character.valid ? character.codePoint : byteCarrierBase + character.codePoint));
        rest.remove_prefix(character.length);
    }
    return wide;
}

}  // namespace KO
