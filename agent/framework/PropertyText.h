#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace KO {

/**
 * The content of a property file: lines "key=value"; the first line of a key is used. Blank lines, lines that begin
 * with '#' and lines without '=' are comments. Blanks around key and value are ignored.
 *
 * In keys and values a backslash is written \\, a line feed \n, a carriage return \r, and \xNN is
 * the byte with that hexadecimal number; so are written other control characters, blanks at the ends
 * of a key or value, and '=' and '#' in a key. A backslash before anything else is a backslash.
 */
class PropertyText {
public:
    explicit PropertyText(std::string_view text = {});

    /** The value of a key, if the file has it. */
    std::optional<std::string> get(const std::string& key) const;

    /** Sets a key's value: in its line, or in a new one at the end. */
    void set(const std::string& key, const std::string& value);

    /** The complete content; lines of other keys are unchanged. */
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
