#include "framework/PropertyText.h"

#include <algorithm>

namespace KO {

namespace {

constexpr std::string_view hexDigits = "0123456789ABCDEF";
constexpr std::string_view blanks = " \t\r";
constexpr std::string_view namedBytes = "\\\n\r";  // with an escape of two characters
constexpr std::string_view namesOfBytes = "\\nr";  // the second character of each escape

std::string_view trim(std::string_view text) {
    const std::size_t first = text.find_first_not_of(blanks);
    if (first == std::string_view::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

bool isControl(char byte) {
    return (byte >= '\0' && byte < ' ') || byte == '\x7f';
}

void appendByteEscape(std::string& text, char byte) {
    const auto number = static_cast<unsigned char>(byte);
    text += "\\x";
    text += hexDigits[number >> 4U];
    text += hexDigits[number & 15U];
}

/** @param alsoEscaped further characters to escape */
std::string escape(const std::string& plain, std::string_view alsoEscaped) {
    std::string text;
    for (std::size_t index = 0; index < plain.size(); ++index) {
        const char byte = plain[index];
        const bool blankAtEnd = byte == ' ' && (index == 0 || index + 1 == plain.size());
        const std::size_t named = namedBytes.find(byte);
        if (named != std::string_view::npos) {
            text += '\\';
            text += namesOfBytes[named];
        } else if (isControl(byte) || blankAtEnd || alsoEscaped.find(byte) != std::string_view::npos) {
            appendByteEscape(text, byte);
        } else {
            text += byte;
        }
    }
    return text;
}

/** Decodes the escape at the start of a string. @return its length; 0 if there is none */
std::size_t decodeEscape(std::string_view text, char& byte) {
    if (text.size() < 2 || text[0] != '\\') {
        return 0;
    }
    const std::size_t named = namesOfBytes.find(text[1]);
    if (named != std::string_view::npos) {
        byte = namedBytes[named];
        return 2;
    }
    if (text[1] != 'x' || text.size() < 4) {
        return 0;
    }
    const std::size_t high = hexDigits.find(text[2]);
    const std::size_t low = hexDigits.find(text[3]);
    if (high == std::string_view::npos || low == std::string_view::npos) {
        return 0;
    }
    byte = static_cast<char>(high * 16 + low);
    return 4;
}

std::string unescape(std::string_view text) {
    std::string plain;
    while (!text.empty()) {
        char byte = text.front();
        const std::size_t length = decodeEscape(text, byte);
        plain += byte;
        text.remove_prefix(std::max<std::size_t>(length, 1));
    }
    return plain;
}

}  // namespace

PropertyText::PropertyText(std::string_view text) {
    while (!text.empty()) {
        const std::size_t end = std::min(text.find('\n'), text.size());
        lines.push_back(parseLine(text.substr(0, end)));
        text.remove_prefix(std::min(end + 1, text.size()));
    }
}

PropertyText::Line PropertyText::parseLine(std::string_view raw) {
    Line line{std::string(raw), std::nullopt, {}};
    const std::size_t equals = raw.find('=');
    const std::string_view content = trim(raw);
    if (equals != std::string_view::npos && content.front() != '#') {
        line.key = unescape(trim(raw.substr(0, equals)));
        line.value = unescape(trim(raw.substr(equals + 1)));
    }
    return line;
}

const PropertyText::Line* PropertyText::find(const std::string& key) const {
    const auto line = std::find_if(lines.begin(), lines.end(), [&key](const Line& each) { return each.key == key; });
    return line != lines.end() ? &*line : nullptr;
}

std::optional<std::string> PropertyText::get(const std::string& key) const {
    const Line* line = find(key);
    return line != nullptr ? std::optional<std::string>(line->value) : std::nullopt;
}

void PropertyText::set(const std::string& key, const std::string& value) {
    Line line{escape(key, "=#") + "=" + escape(value, ""), key, value};
    if (const Line* present = find(key)) {
        lines[static_cast<std::size_t>(present - lines.data())] = std::move(line);
    } else {
        lines.push_back(std::move(line));
    }
}

std::string PropertyText::text() const {
    std::string text;
    for (const Line& line : lines) {
        text += line.raw;
        text += '\n';
    }
    return text;
}

}  // namespace KO
