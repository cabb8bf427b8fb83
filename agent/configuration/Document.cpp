#include "configuration/Document.h"

#include <algorithm>
#include <cstdlib>
#include <sstream>
#include <toml.hpp>

#include "cim/Utf8.h"
#include "configuration/FileContent.h"

namespace Agent {

namespace {

constexpr std::size_t largestDocument = 128U << 10U;  // the parser needs quadratic time for long arrays

std::string invalid(const std::string& name, std::size_t line, std::string_view reason) {
    return name + " is not valid TOML (line " + std::to_string(line) + ": " + std::string(reason) +
           "); using the defaults";
}

std::size_t lineAt(std::string_view text, std::size_t position) {
    const std::string_view before = text.substr(0, position);
    return 1 + static_cast<std::size_t>(std::count(before.begin(), before.end(), '\n'));
}

/** Returns the first line of the parser's message without the name of the function that failed. */
std::string_view reasonOf(const toml::exception& failure) {
    std::string_view message = failure.what();
    message = message.substr(0, message.find('\n'));
    const std::size_t name = message.find(": ");
    message.remove_prefix(name != std::string_view::npos ? name + 2 : 0);
    return message.substr(0, message.find_last_not_of(" .") + 1);
}

/** Returns the length of the string at the start of a document, including its quotation marks. */
std::size_t stringLength(std::string_view document) {
    const char quote = document.front();
    const std::string_view longDelimiter = quote == '"' ? R"(""")" : "'''";
    const bool isMultiLine = document.substr(0, 3) == longDelimiter;
    const std::string_view delimiter = longDelimiter.substr(0, isMultiLine ? 3 : 1);
    std::size_t length = delimiter.size();
    while (length < document.size() && document.substr(length, delimiter.size()) != delimiter &&
           (isMultiLine || document[length] != '\n')) {
        length += quote == '"' && document[length] == '\\' ? 2 : 1;
    }
    length += delimiter.size();
    for (int more = 0; isMultiLine && more < 2 && length < document.size() && document[length] == quote; ++more) {
        ++length;  // quotation marks that belong to the value
    }
    return std::min(length, document.size());
}

/** Returns the length of the string, comment or single character at the start of a document. */
std::size_t tokenLength(std::string_view document) {
    switch (document.front()) {
        case '"':
        case '\'':
            return stringLength(document);
        case '#':
            return std::min(document.find('\n'), document.size());
        default:
            return 1;
    }
}

bool isOneOf(char byte, std::string_view bytes) {
    return bytes.find(byte) != std::string_view::npos;
}

}  // namespace

std::optional<std::size_t> lineNestedTooDeep(std::string_view document) {
    int brackets = 0;
    int dots = 0;  // in the current key
    std::size_t line = 1;
    while (!document.empty()) {
        const char first = document.front();
        const std::string_view token = document.substr(0, tokenLength(document));
        brackets += isOneOf(first, "[{") ? 1 : 0;
        brackets -= isOneOf(first, "]}") ? 1 : 0;
        dots = isOneOf(first, "=,[{\n") ? 0 : dots + (first == '.' ? 1 : 0);
        if (std::max(brackets, dots) > deepestNesting) {
            return line;
        }
        line += static_cast<std::size_t>(std::count(token.begin(), token.end(), '\n'));
        document.remove_prefix(token.size());
    }
    return std::nullopt;
}

Document Document::read(const std::string& path) {
    const FileContent file = readFile(path);
    if (file.error == 0) {
        return parse(file.text, path);
    }
    Document document;
    if (!file.absent()) {
        document.whatIsWrong = path + " cannot be read (" + errorText(file.error) + "); using the defaults";
    }
    return document;
}

Document Document::readDefault() {
    const char* path = ::secure_getenv("OSTREL_CONFIG");
    return read(path != nullptr && *path != '\0' ? path : "/etc/ostrel/agent.toml");
}

Document Document::parse(std::string_view text, const std::string& name) {
    Document document;
    if (text.size() > largestDocument) {
        document.whatIsWrong =
            name + " is larger than " + std::to_string(largestDocument) + " bytes; using the defaults";
        return document;
    }
    if (const std::size_t position = cim::findInvalidUtf8(text); position != std::string_view::npos) {
        document.whatIsWrong = invalid(name, lineAt(text, position), "a character is not UTF-8");
        return document;
    }
    if (const std::optional<std::size_t> line = lineNestedTooDeep(text)) {
        document.whatIsWrong = invalid(name, *line, "nested too deep");
        return document;
    }
    try {
        std::istringstream stream{std::string(text)};
        document.table = std::make_shared<const TomlTable>(
            toml::parse<toml::discard_comments, std::map, std::vector>(stream).as_table());
    } catch (const toml::exception& failure) {
        document.whatIsWrong = invalid(name, failure.location().line(), reasonOf(failure));
    }
    return document;
}

}  // namespace Agent
