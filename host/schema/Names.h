#pragma once

#include <string>
#include <string_view>

namespace cimhost {

/** CIM names ignore the case of ASCII letters; all other bytes are compared as they are. */
bool sameName(std::string_view left, std::string_view right);

/** The name in lower case, as a key of tables. */
std::string foldedName(std::string_view name);

/** Order of names that ignores letter case. */
struct NameLess {
    using is_transparent = void;
    bool operator()(std::string_view left, std::string_view right) const;
};

/** Whether the text is a CIM name: a letter or underscore, then letters, digits and underscores. */
bool isName(std::string_view text);

}  // namespace cimhost
