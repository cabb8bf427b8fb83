#include "cli/Style.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <charconv>
#include <cstdlib>
#include <string_view>

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

}  // namespace

Style styleFor(int descriptor, Colours wish) {
    const bool isTerminal = isatty(descriptor) == 1;
    const bool wanted = isTerminal && variable("NO_COLOR").empty() && variable("TERM") != "dumb";
    Style style;
    style.colours = wish == Colours::always || (wish == Colours::automatic && wanted);
    style.width = isTerminal ? widthOf(descriptor) : 0;
    return style;
}

std::string painted(const std::string& text, Role role, const Style& style) {
    const char* code = codeOf(role);
    return style.colours && code != nullptr && !text.empty() ? "\033[" + std::string(code) + "m" + text + "\033[0m"
                                                             : text;
}

}  // namespace cimhost::text
