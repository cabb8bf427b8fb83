#include <algorithm>

#include "configuration/Document.h"

namespace Agent {

namespace {

/** Returns the length of the string at the start of a document, with its quotation marks. */
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
        ++length;  // quotation marks at the end of the value itself
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
    int dots = 0;  // of one key
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

}  // namespace Agent
