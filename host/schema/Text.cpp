#include "schema/Text.h"

#include <array>
#include <charconv>
#include <cstdio>

#include "schema/Errors.h"

namespace cimhost {
namespace {

struct Escape {
    char code;
    char character;
};

constexpr Escape escapes[] = {{'b', '\b'}, {'t', '\t'}, {'n', '\n'},  {'f', '\f'},
                              {'r', '\r'}, {'"', '"'},  {'\'', '\''}, {'\\', '\\'}};

/** Characters in UTF-8 by their first byte: how many bytes they have, and from where to where the second may go. */
struct Sequence {
    unsigned char from;
    unsigned char to;
    std::size_t length;
    unsigned char secondFrom;
    unsigned char secondTo;
};

constexpr Sequence sequences[] = {
    {0x00, 0x7F, 1, 0, 0},       {0xC2, 0xDF, 2, 0x80, 0xBF}, {0xE0, 0xE0, 3, 0xA0, 0xBF},
    {0xE1, 0xEC, 3, 0x80, 0xBF}, {0xED, 0xED, 3, 0x80, 0x9F}, {0xEE, 0xEF, 3, 0x80, 0xBF},
    {0xF0, 0xF0, 4, 0x90, 0xBF}, {0xF1, 0xF3, 4, 0x80, 0xBF}, {0xF4, 0xF4, 4, 0x80, 0x8F},
};

/** How many bytes at the front are a character, or as much of one as there is. */
std::size_t charactersBytes(std::string_view text, bool& isWhole) {
    const auto isWithin = [&](std::size_t index, unsigned char from, unsigned char to) {
        const auto byte = static_cast<unsigned char>(text[index]);
        return byte >= from && byte <= to;
    };
    isWhole = false;
    for (const Sequence& sequence : sequences) {
        if (isWithin(0, sequence.from, sequence.to)) {
            std::size_t count = 1;
            while (count < sequence.length && count < text.size() &&
                   (count == 1 ? isWithin(1, sequence.secondFrom, sequence.secondTo) : isWithin(count, 0x80, 0xBF))) {
                ++count;
            }
            isWhole = count == sequence.length;
            return count;
        }
    }
    return 1;
}

bool isHex(char c) {
    return (c >= '0' && c <= '9') || (c >= 'a' && c <= 'f') || (c >= 'A' && c <= 'F');
}

bool isHighSurrogate(std::uint32_t unit) {
    return unit >= 0xD800 && unit < 0xDC00;
}

bool isLowSurrogate(std::uint32_t unit) {
    return unit >= 0xDC00 && unit < 0xE000;
}

/** Reads the unit of an \x escape whose "\x" is at the front, and takes it off. */
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

void takeCharacter(std::string& text, std::string_view& rest) {
    const std::uint32_t unit = takeUnit(rest);
    if (unit == 0) {
        throw ValueError("a string cannot hold the character \\x0");
    }
    if (!isHighSurrogate(unit) && !isLowSurrogate(unit)) {
        appendUtf8(text, unit);
        return;
    }
    const std::uint32_t second = isHighSurrogate(unit) && startsUnit(rest) ? takeUnit(rest) : 0;
    if (!isLowSurrogate(second)) {
        throw ValueError("a \\x escape from D800 to DFFF is half a character and needs its other half beside it");
    }
    appendUtf8(text, 0x10000 + ((unit - 0xD800) << 10) + (second - 0xDC00));
}

}  // namespace

std::string inQuotes(std::string_view text) {
    std::string result = "\"";
    for (const char c : text) {
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
    std::string text;
    while (!content.empty()) {
        if (startsUnit(content)) {
            takeCharacter(text, content);
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
        text += c;
    }
    return text;
}

std::string wellFormed(std::string_view text) {
    std::string result;
    while (!text.empty()) {
        bool isWhole = false;
        const std::size_t bytes = charactersBytes(text, isWhole);
        result += isWhole ? text.substr(0, bytes) : "\uFFFD";
        text.remove_prefix(bytes);
    }
    return result;
}

void appendUtf8(std::string& text, std::uint32_t codePoint) {
    const auto add = [&](std::uint32_t byte) { text += static_cast<char>(static_cast<unsigned char>(byte)); };
    if (codePoint < 0x80) {
        add(codePoint);
        return;
    }
    const int continuations = codePoint < 0x800 ? 1 : codePoint < 0x10000 ? 2 : 3;
    const std::uint32_t lead = continuations == 1 ? 0xC0 : continuations == 2 ? 0xE0 : 0xF0;
    add(lead | (codePoint >> (6 * continuations)));
    for (int i = continuations - 1; i >= 0; --i) {
        add(0x80 | ((codePoint >> (6 * i)) & 0x3F));
    }
}

bool singleCharacter(std::string_view text, std::uint16_t& code) {
    const auto byte = [&](std::size_t i) { return static_cast<std::uint32_t>(static_cast<unsigned char>(text[i])); };
    std::uint32_t found = 0;
    if (text.size() == 1) {
        found = byte(0);
    } else if (text.size() == 2) {
        found = ((byte(0) & 0x1F) << 6) | (byte(1) & 0x3F);
    } else if (text.size() == 3) {
        found = ((byte(0) & 0x0F) << 12) | ((byte(1) & 0x3F) << 6) | (byte(2) & 0x3F);
    } else {
        return false;
    }
    std::string again;
    appendUtf8(again, found);
    code = static_cast<std::uint16_t>(found);
    return again == text;
}

}  // namespace cimhost
