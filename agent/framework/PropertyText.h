#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace KO {

/**
 * The content of a property file: lines of the form "key=value". If several lines have the same key, the first is used.
 * Blank lines, lines that begin with '#' and lines without '=' are comments. Blanks around key and value are ignored.
 *
 * In keys and values, a backslash is written as \\, a line feed as \n and a carriage return as \r. Other control
 * characters, blanks at the ends of a key or value, and '=' and '#' in a key are written as \xNN, the byte's value in
 * hexadecimal digits. A backslash before any other character is literal.
 */
class PropertyText {
public:
    explicit PropertyText(std::string_view text = {});

    /** The value of a key; none if the content does not have the key. */
    std::optional<std::string> get(const std::string& key) const;

    /** Sets a key's value in its existing line, or in a new line at the end. */
    void set(const std::string& key, const std::string& value);

    /** The complete content. Lines of keys that were not set are unchanged. */
    std::string text() const;

private:
    struct Line {
        std::string raw;                 ///< without line feed
        std::optional<std::string> key;  ///< absent for a comment
        std::string value;
    };

    static Line parseLine(std::string_view raw);
    const Line* find(const std::string& key) const;

    std::vector<Line> lines;
};

}  // namespace KO
