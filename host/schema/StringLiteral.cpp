#include "schema/StringLiteral.h"

#include <array>
#include <charconv>
#include <cstdio>

#include "cim/Utf8.h"
#include "schema/Errors.h"

namespace cimhost {
namespace {

struct Escape {
    char code;
    char character;
};

constexpr Escape escapes[] = {{'b', '\b'}, {'t', '\t'}, {'n', '\n'},  {'f', '\f'},
                              {'r', '\r'}, {'"', '"'},  {'\'', '\''}, {'\\', '\\'}};

bool isHex(char c) {
    return (c >= '0' && c <= '9') || (c >= 'a' && c <= 'f') || (c >= 'A' && c <= 'F');
}

bool isHighSurrogate(std::uint32_t unit) {
    return unit >= 0xD800 && unit < 0xDC00;
}

bool isLowSurrogate(std::uint32_t unit) {
    return unit >= 0xDC00 && unit < 0xE000;
}

/** Removes the \x escape at the front and returns its code unit. */
std::uint32_t takeUnit(std::string_view& rest) {
    std::size_t end = 2;
    while (end < rest.size() && end < 6 && isHex(rest[end])) {
        ++end;
    }
    std::uint32_t unit = 0;
    std::from_chars(rest.data() + 2, rest.data() + end, unit, 16);
    rest.remove_prefix(end);
    return unit;
}

bool startsUnit(std::string_view rest) {
    return rest.size() > 2 && rest[0] == '\\' && (rest[1] == 'x' || rest[1] == 'X');
}

void takeCharacter(std::string& string, std::string_view& rest) {
    const std::uint32_t unit = takeUnit(rest);
    if (unit == 0) {
        throw ValueError("a string cannot hold the character \\x0");
    }
    if (!isHighSurrogate(unit) && !isLowSurrogate(unit)) {
        cim::appendUtf8(string, unit);
        return;
    }
    const std::uint32_t second = isHighSurrogate(unit) && startsUnit(rest) ? takeUnit(rest) : 0;
    if (!isLowSurrogate(second)) {
        throw ValueError("a \\x escape from D800 to DFFF is a surrogate: write the other one of its pair beside it");
    }
    cim::appendUtf8(string, 0x10000 + ((unit - 0xD800) << 10) + (second - 0xDC00));
}

}  // namespace

std::string inQuotes(std::string_view string) {
    std::string result = "\"";
    for (const char c : string) {
        const Escape* known = nullptr;
        for (const Escape& escape : escapes) {
            known = escape.character == c && c != '\'' ? &escape : known;
        }
        if (known != nullptr) {
            result += {'\\', known->code};
        } else if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F) {
            std::array<char, 8> unit{};
            std::snprintf(unit.data(), unit.size(), "\\x%04X", static_cast<unsigned>(c));
            result += unit.data();
        } else {
            result += c;
        }
    }
    return result + '"';
}

std::string unescaped(std::string_view content) {
    std::string string;
    while (!content.empty()) {
        if (startsUnit(content)) {
            takeCharacter(string, content);
            continue;
        }
        char c = content.front();
        content.remove_prefix(1);
        if (c == '\0') {
            throw ValueError("a string cannot hold a null character");
        }
        if (c == '\\' && !content.empty()) {
            for (const Escape& escape : escapes) {
                c = escape.code == content.front() ? escape.character : c;
            }
            content.remove_prefix(1);
        }
        string += c;
    }
    return string;
}

std::optional<std::uint16_t> singleCharacter(std::string_view string) {
    if (string.empty()) {
        return std::nullopt;
    }
    const cim::Utf8Character character = cim::firstCharacter(string);
    const bool isSingle = character.valid && character.length == string.size() && character.codePoint <= 0xFFFF;
    return isSingle ? std::optional(static_cast<std::uint16_t>(character.codePoint)) : std::nullopt;
}

}  // namespace cimhost
