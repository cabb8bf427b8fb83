#include "cimxml/XmlWriter.h"

#include <algorithm>

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
        default:
            return nullptr;
    }
}

bool isPermitted(const cim::Utf8Character& character) {
    const std::uint32_t code = character.codePoint;
    return character.valid && (code >= 0x20 || code == '\t' || code == '\n' || code == '\r') && code != 0xFFFE &&
           code != 0xFFFF;
}

/** Number of leading bytes that are printable ASCII, which nearly all values consist of. */
std::size_t plainLength(std::string_view characters) {
    std::size_t length = 0;
    const auto isPlain = [](unsigned char byte) { return byte >= 0x20 && byte < 0x80; };
    while (length < characters.size() && isPlain(static_cast<unsigned char>(characters[length]))) {
        ++length;
    }
    return length;
}

}  // namespace

void appendEscaped(std::string& xml, std::string_view characters) {
    while (true) {
        const auto special = std::find_if(characters.begin(), characters.end(),
                                          [](char character) { return entityOf(character) != nullptr; });
        const auto plain = static_cast<std::size_t>(special - characters.begin());
        xml += characters.substr(0, plain);
        if (special == characters.end()) {
            return;
        }
        xml += entityOf(*special);
        characters.remove_prefix(plain + 1);
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
    characters.remove_prefix(plainLength(characters));
    while (!characters.empty()) {
        const cim::Utf8Character first = cim::firstCharacter(characters);
        if (!isPermitted(first)) {
            return false;
        }
        characters.remove_prefix(first.length);
    }
    return true;
}

std::string representable(std::string_view characters) {
    std::string result;
    while (!characters.empty()) {
        const cim::Utf8Character first = cim::firstCharacter(characters);
        result += isPermitted(first) ? std::string(characters.substr(0, first.length)) : std::string("\xEF\xBF\xBD");
        characters.remove_prefix(first.length);
    }
    return result;
}

}  // namespace cimhost::cimxml
