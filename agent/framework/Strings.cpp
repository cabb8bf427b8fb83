#include "KO/Strings.h"

#include "configuration/Utf8.h"

#include <cstdint>

namespace KO {

namespace {

// A byte that is not UTF-8 becomes the lone surrogate 0xDC00 + byte, which no valid text holds.
constexpr std::uint32_t firstByteCarrier = 0xDC80;
constexpr std::uint32_t lastByteCarrier = 0xDCFF;
constexpr std::uint32_t byteCarrierBase = 0xDC00;
constexpr std::uint32_t replacementCharacter = 0xFFFD;

void appendUtf8(std::string& text, std::uint32_t codePoint) {
    const auto append = [&text](std::uint32_t byte) { text.push_back(static_cast<char>(byte)); };
    const auto appendTail = [&append, codePoint](unsigned int shift) {
        append(0x80U | ((codePoint >> shift) & 0x3FU));
    };
    if (codePoint < 0x80) {
        append(codePoint);
    } else if (codePoint < 0x800) {
        append(0xC0U | (codePoint >> 6U));
        appendTail(0);
    } else if (codePoint < 0x10000) {
        append(0xE0U | (codePoint >> 12U));
        appendTail(6);
        appendTail(0);
    } else {
        append(0xF0U | (codePoint >> 18U));
        appendTail(12);
        appendTail(6);
        appendTail(0);
    }
}

bool canBeEncoded(std::uint32_t number) {
    return number <= 0x10FFFF && (number < 0xD800 || number > 0xDFFF);
}

}  // namespace

std::string make_string(const std::wstring& text) {
    std::string narrow;
    narrow.reserve(text.size());
    for (const wchar_t element : text) {
        const auto number = std::uint32_t{std::char_traits<wchar_t>::to_int_type(element)};
        if (number >= firstByteCarrier && number <= lastByteCarrier) {
            narrow.push_back(static_cast<char>(number - byteCarrierBase));
        } else {
            appendUtf8(narrow, canBeEncoded(number) ? number : replacementCharacter);
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
        const Agent::Utf8Character character = Agent::firstCharacter(rest);
        wide.push_back(
            static_cast<wchar_t>(character.valid ? character.codePoint : byteCarrierBase + character.codePoint));
        rest.remove_prefix(character.length);
    }
    return wide;
}

}  // namespace KO
