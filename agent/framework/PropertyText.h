#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace KO {

/**
 * The text of a property file: lines "key=value", first line of a key counts. Blank lines, lines
 * that begin with '#' and lines without '=' are comments. Blanks around key and value do not count.
 *
 * In keys and values a backslash is written \\, a line feed \n, a carriage return \r, and \xNN is
 * the byte with that hexadecimal number; so are written other control characters, blanks at the ends
 * of a key or value, and '=' and '#' in a key. A backslash before anything else is a backslash.
 */
class PropertyText {
public:
    explicit PropertyText(std::string_view text = {});

    /** The value of a key, if it is there. */
    std::optional<std::string> get(const std::string& key) const;

    /** Sets a key's value: in its line, or in a new one at the end. */
    void set(const std::string& key, const std::string& value);

    /** The whole text; lines that were not set are as they were read. */
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
