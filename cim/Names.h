#pragma once

#include <string>
#include <string_view>

namespace cim {

/** Whether two names are the same: the case of the letters A to Z is ignored, in every locale. */
bool sameName(std::string_view left, std::string_view right);

/** The name in lower case, for use as a key. */
std::string foldedName(std::string_view name);

/** Order of names that ignores letter case. */
struct NameLess {
    using is_transparent = void;
    bool operator()(std::string_view left, std::string_view right) const;
};

/** Whether a string is a CIM name: a letter or underscore, then letters, digits and underscores. */
bool isName(std::string_view string);

}  // namespace cim
