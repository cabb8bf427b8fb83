#include "cimxml/XmlWriter.h"

#include <array>
#include <cstdint>
#include <cstring>

#include "cim/Utf8.h"

namespace cimhost::cimxml {
namespace {

const char* entityOf(char character) {
    switch (character) {
        case '&':
            return "&amp;";
        case '<':
            return "&lt;";
        case '>':
            return "&gt;";
        case '"':
            return "&quot;";
        case '\'':
            return "&apos;";
        case '\r':
            return "&#13;";  // a parser reads an unescaped one as a line feed
        default:
            return nullptr;
    }
}

bool isPermitted(const cim::Utf8Character& character) {
    const std::uint32_t code = character.codePoint;
    return character.valid && (code >= 0x20 || code == '\t' || code == '\n' || code == '\r') && code != 0xFFFE &&
           code != 0xFFFF;
}

/** Marks the bytes that are written as they are: printable ASCII except the characters that are escaped. */
constexpr std::array<bool, 256> makePlain() {
    std::array<bool, 256> plain{};
    for (std::size_t byte = ' '; byte < 0x7F; ++byte) {
        plain[byte] = byte != '&' && byte != '<' && byte != '>' && byte != '"' && byte != '\'';
    }
    return plain;
}

/** Number of leading plain bytes. Nearly all values consist of plain bytes only. */
std::size_t plainLength(std::string_view characters) {
    static constexpr std::array<bool, 256> plain = makePlain();
    std::size_t length = 0;
    while (length < characters.size() && plain[static_cast<unsigned char>(characters[length])]) {
        ++length;
    }
    return length;
}

/** Number of leading bytes from 0x20 to 0x7F. Compares eight bytes at once. */
std::size_t asciiLength(std::string_view characters) {
    constexpr std::uint64_t ones = 0x0101010101010101;
    std::size_t length = 0;
    for (std::uint64_t word = 0; length + sizeof word <= characters.size(); length += sizeof word) {
        std::memcpy(&word, characters.data() + length, sizeof word);
        if ((((word - ones * ' ') | word) & (ones * 0x80)) != 0) {
            break;
        }
    }
    while (length < characters.size() && static_cast<signed char>(characters[length]) >= ' ') {
        ++length;
    }
    return length;
}

}  // namespace

void appendEscaped(std::string& xml, std::string_view characters) {
    while (true) {
        const std::size_t length = plainLength(characters);
        xml.append(characters, 0, length);
        characters.remove_prefix(length);
        if (characters.empty()) {
            return;
        }
        const cim::Utf8Character first = cim::firstCharacter(characters);
        if (const char* entity = entityOf(characters.front())) {
            xml += entity;
        } else if (isPermitted(first)) {
            xml.append(characters, 0, first.length);
        } else {
            xml += "\xEF\xBF\xBD";
        }
        characters.remove_prefix(first.length);
    }
}

void appendAttribute(std::string& xml, std::string_view name, std::string_view value) {
    xml += ' ';
    xml += name;
    xml += "=\"";
    appendEscaped(xml, value);
    xml += '"';
}

bool isRepresentable(std::string_view characters) {
    while (true) {
        characters.remove_prefix(asciiLength(characters));
        if (characters.empty()) {
            return true;
        }
        const cim::Utf8Character first = cim::firstCharacter(characters);
        if (!isPermitted(first)) {
            return false;
        }
        characters.remove_prefix(first.length);
    }
}

}  // namespace cimhost::cimxml
