#include "configuration/TomlText.h"

#include <algorithm>
#include <string>

namespace Agent {

namespace {

/** Each makes the parser go one table deeper; the configuration needs one. */
constexpr std::size_t mostDotsOfALine = 16;

constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";

bool isAscii(char byte) {
    return static_cast<unsigned char>(byte) < 0x80;
}

bool isOneOf(char byte, std::string_view bytes) {
    return bytes.find(byte) != std::string_view::npos;
}

bool isBlank(char byte) {
    return byte == ' ' || byte == '\t' || byte == '\r';
}

/**
 * Whether a byte stands in a value that is neither string nor array nor table, such as a number. In the rest of such a
 * value the parser looks for the end without knowing of strings, in which it would come upon any character.
 */
class BareValue {
public:
    /** Takes what is outside of strings and comments, byte by byte. @param isFirst whether nothing is before it */
    void follow(char byte, bool isFirst) {
        isHeader = (isHeader && byte != '\n') || (byte == '[' && isFirst && nesting.empty());
        if (isOneOf(byte, "[{")) {
            nesting.push_back(byte);
        } else if (isOneOf(byte, "]}") && !nesting.empty()) {
            nesting.pop_back();
        }
        const bool isElement = !isHeader && !nesting.empty() && nesting.back() == '[';
        if (byte == '=' || isOneOf(byte, "[{,\n")) {
            isAwaited = byte == '=' || isElement;
        } else if (!isBlank(byte)) {
            isInside = (isInside || isAwaited) && !isOneOf(byte, "]}");
            isAwaited = false;
        }
        isInside = isInside && !isBlank(byte) && !isOneOf(byte, "\n,");
    }

    void followString() { isAwaited = false; }

    /** Whether a byte cannot go on with the value in which it stands. */
    bool isBrokenBy(char byte) const { return isInside && isOneOf(byte, "=[{\"'"); }

private:
    std::string nesting{};  ///< the brackets that are open
    bool isHeader = false;  ///< in the line of a table's name
    bool isAwaited = false;
    bool isInside = false;
};

/** Goes over a text once, knowing of TOML no more than what is string, what is comment and what neither. */
class Scan {
public:
    explicit Scan(std::string_view text) : rest(text) {
        if (startsWith(byteOrderMark)) {
            skip(byteOrderMark.size());
        }
    }

    std::optional<Objection> run() {
        while (!rest.empty() && reason == nullptr) {
            step();
        }
        return reason != nullptr ? std::optional<Objection>({line, reason}) : std::nullopt;
    }

private:
    void step() {
        const char byte = rest.front();
        if (value.isBrokenBy(byte)) {
            reason = "a value goes on where it has to end";
        } else if (byte == '"' || byte == '\'') {
            skipString(byte);
            reason = isOneOf(last, "\n=,[{.") ? reason : "a string stands where none may be";
            last = byte;
            value.followString();
        } else if (byte == '#') {
            skip(std::min(rest.find('\n'), rest.size()));
        } else if (!isAscii(byte)) {
            reason = "a character outside of ASCII stands outside of strings and comments";
        } else {
            skip(1);
            value.follow(byte, last == '\n');
            last = byte == ' ' || byte == '\t' ? last : byte;
            dots += byte == '.' ? 1 : 0;
            reason = dots > mostDotsOfALine ? "a key has too many parts" : nullptr;
        }
    }

    void skipString(char quote) {
        const std::string_view delimiter = quote == '"' ? R"(""")" : "'''";
        const bool isLong = startsWith(delimiter);
        const std::string_view end = isLong ? delimiter : delimiter.substr(0, 1);
        skip(end.size());
        while (!rest.empty() && !startsWith(end) && (isLong || rest.front() != '\n')) {
            const bool isEscape = quote == '"' && rest.front() == '\\';
            skip(1);
            if (isEscape) {
                skipEscaped(isLong);
            }
        }
        skip(end.size());
        for (int more = 0; isLong && more < 2 && !rest.empty() && rest.front() == quote; ++more) {
            skip(1);  // quotation marks at the end of the text itself
        }
    }

    /** What follows a backslash: in a long string also the blanks over which a text goes on. */
    void skipEscaped(bool isLong) {
        const std::size_t blanks = std::min(rest.find_first_not_of(" \t\r\n"), rest.size());
        skip(isLong ? blanks : 0);
        if (!rest.empty() && !isAscii(rest.front())) {
            reason = "a text that goes on after a backslash must do so with an ASCII character";
        } else if (blanks == 0) {
            skip(1);
        }
    }

    bool startsWith(std::string_view head) const { return rest.substr(0, head.size()) == head; }

    void skip(std::size_t length) {
        const std::string_view skipped = rest.substr(0, length);
        const auto lineEnds = static_cast<std::size_t>(std::count(skipped.begin(), skipped.end(), '\n'));
        line += lineEnds;
        dots = lineEnds != 0 ? 0 : dots;
        rest.remove_prefix(skipped.size());
    }

    std::string_view rest;
    std::size_t line = 1;
    std::size_t dots = 0;  ///< of this line
    BareValue value{};
    char last = '\n';  ///< the byte before that is neither blank nor in a string or comment
    const char* reason = nullptr;
};

}  // namespace

std::optional<Objection> objectionTo(std::string_view text) {
    return Scan(text).run();
}

}  // namespace Agent
