#include "cli/TextLayout.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <charconv>
#include <clocale>
#include <cstdlib>
#include <cwchar>
#include <utility>

namespace cimhost::text {
namespace {

std::string_view variable(const char* name) {
    const char* value = ::secure_getenv(name);
    return value == nullptr ? std::string_view() : std::string_view(value);
}

std::size_t widthOf(int descriptor) {
    const std::string_view columns = variable("COLUMNS");
    std::size_t width = 0;
    const auto [end, error] = std::from_chars(columns.data(), columns.data() + columns.size(), width);
    if (error == std::errc() && end == columns.data() + columns.size() && width > 0) {
        return width;
    }
    winsize window{};
    return ioctl(descriptor, TIOCGWINSZ, &window) == 0 ? window.ws_col : 0;
}

const char* codeOf(Role role) {
    switch (role) {
        case Role::heading:
            return "1";  // bold
        case Role::name:
            return "36";  // cyan
        case Role::detail:
            return "2";  // faint
        case Role::alarm:
            return "1;31";  // bold, red
        default:
            return nullptr;
    }
}

/** Sets the encoding of the C library to UTF-8 for this thread, until the object is destroyed. */
class Utf8Locale {
public:
    Utf8Locale() : before(uselocale(utf8())) {}
    ~Utf8Locale() { uselocale(before); }
    Utf8Locale(const Utf8Locale&) = delete;
    Utf8Locale& operator=(const Utf8Locale&) = delete;

private:
    static locale_t utf8() {
        static const locale_t locale = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
        return locale;  // if null, uselocale changes nothing, and bytes are counted
    }

    locale_t before;
};

constexpr std::size_t gap = 2;              ///< spaces between columns
constexpr std::size_t leastLastWidth = 16;  ///< the last column needs at least this width

/** The end of the longest part that is not wider than the limit: after its last space, if it has one. */
std::size_t endOfPart(const std::string& text, std::size_t begin, std::size_t limit) {
    std::size_t afterBlank = begin;
    std::size_t width = 0;
    for (std::size_t position = begin; position < text.size();) {
        const CharacterSize next = sizeOfFirst(std::string_view(text).substr(position));
        width += next.columns;
        if (width > limit && position > begin) {
            return afterBlank > begin ? afterBlank : position;
        }
        position += next.bytes;
        afterBlank = text[position - 1] == ' ' ? position : afterBlank;
    }
    return text.size();
}

/** Splits a string into parts that fit into the room. @param room in columns; 0: unlimited */
std::vector<std::string> parts(const std::string& text, std::size_t room) {
    std::vector<std::string> found;
    for (std::size_t begin = 0; begin < text.size();) {
        const std::size_t end = room == 0 ? text.size() : endOfPart(text, begin, room);
        found.push_back(text.substr(begin, end - begin));
        begin = end;
    }
    return found;
}

/** The layout of rows in aligned columns. */
class Layout {
public:
    Layout(const std::vector<Row>& rows, std::string itsIndent, const Style& itsStyle,
           const std::vector<Role>& itsRoles)
        : indent(std::move(itsIndent)), style(itsStyle), roles(itsRoles) {
        std::size_t last = 0;
        for (const Row& row : rows) {
            widths.resize(std::max(widths.size(), row.size()));
            for (std::size_t i = 0; i < row.size(); ++i) {
                widths[i] = std::max(widths[i], columnsOf(row[i]));
            }
        }
        if (!widths.empty()) {
            last = widths.back();
            widths.pop_back();
        }
        for (const std::size_t width : widths) {
            lastBegins += width + gap;
        }
        isNarrow = style.width != 0 && lastBegins + std::min(last, leastLastWidth) > style.width;
    }

    std::string text(const Row& row) const { return row.empty() ? "\n" : isNarrow ? stacked(row) : sideBySide(row); }

private:
    std::string cell(const Row& row, std::size_t column, const std::string& content) const {
        return painted(content, column < roles.size() && column < row.size() ? roles[column] : Role::plain, style);
    }

    std::string sideBySide(const Row& row) const {
        std::string line = indent;
        for (std::size_t i = 0; i + 1 < row.size(); ++i) {
            line += cell(row, i, row[i]) + std::string(widths[i] - columnsOf(row[i]) + gap, ' ');
        }
        const bool hasLast = row.size() == widths.size() + 1;
        return line + below(row, row.size() - 1, hasLast ? lastBegins : 0);
    }

    std::string stacked(const Row& row) const {
        std::string lines = indent + cell(row, 0, row.front()) + "\n";
        const std::string deeper = indent + std::string(gap, ' ');
        for (std::size_t i = 1; i < row.size(); ++i) {
            lines += deeper + below(row, i, deeper.size());
        }
        return lines;
    }

    /** A cell whose continuation lines begin in the same column. */
    std::string below(const Row& row, std::size_t column, std::size_t begins) const {
        const std::size_t room = style.width > begins && begins != 0 ? style.width - begins : 0;
        std::string lines;
        for (const std::string& part : parts(row[column], room)) {
            lines += (lines.empty() ? "" : std::string(begins, ' ')) + cell(row, column, part) + "\n";
        }
        return lines.empty() ? "\n" : lines;
    }

    std::string indent;
    const Style& style;
    const std::vector<Role>& roles;
    std::vector<std::size_t> widths{};  ///< of all columns but the last
    std::size_t lastBegins = indent.size();
    bool isNarrow = false;
};

}  // namespace

Style styleFor(int descriptor, Colours mode) {
    const bool isTerminal = isatty(descriptor) == 1;
    const bool wanted = isTerminal && variable("NO_COLOR").empty() && variable("TERM") != "dumb";
    Style style;
    style.colours = mode == Colours::always || (mode == Colours::automatic && wanted);
    style.width = isTerminal ? widthOf(descriptor) : 0;
    return style;
}

std::string painted(const std::string& text, Role role, const Style& style) {
    const char* code = codeOf(role);
    return style.colours && code != nullptr && !text.empty() ? "\033[" + std::string(code) + "m" + text + "\033[0m"
                                                             : text;
}

CharacterSize sizeOfFirst(std::string_view text) {
    const Utf8Locale utf8;
    std::mbstate_t state{};
    wchar_t character{};
    const std::size_t bytes = std::mbrtowc(&character, text.data(), text.size(), &state);
    if (bytes == 0 || bytes > text.size()) {
        return {1, 1};
    }
    const int columns = ::wcwidth(character);
    return {bytes, columns < 0 ? 1 : static_cast<std::size_t>(columns)};
}

std::size_t columnsOf(std::string_view text) {
    std::size_t columns = 0;
    while (!text.empty()) {
        const CharacterSize first = sizeOfFirst(text);
        columns += first.columns;
        text.remove_prefix(first.bytes);
    }
    return columns;
}

std::string aligned(const std::vector<Row>& rows, const std::string& indent, const Style& style,
                    const std::vector<Role>& roles) {
    const Layout layout(rows, indent, style, roles);
    std::string text;
    for (const Row& row : rows) {
        text += layout.text(row);
    }
    return text;
}

}  // namespace cimhost::text
