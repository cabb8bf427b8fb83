#include "cli/Width.h"

#include <clocale>
#include <cwchar>

namespace cimhost::text {
namespace {

/** Has the C library take texts for UTF-8 while it lives, whatever the user's locale is. */
class Utf8 {
public:
    Utf8() : before(uselocale(utf8())) {}
    ~Utf8() { uselocale(before); }
    Utf8(const Utf8&) = delete;
    Utf8& operator=(const Utf8&) = delete;

private:
    static locale_t utf8() {
        static const locale_t locale = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
        return locale;  // without it, uselocale leaves all as it is, and bytes are counted
    }

    locale_t before;
};

}  // namespace

Character firstCharacter(std::string_view text) {
    const Utf8 utf8;
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
        const Character first = firstCharacter(text);
        columns += first.columns;
        text.remove_prefix(first.bytes);
    }
    return columns;
}

}  // namespace cimhost::text
