#pragma once

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <string>
#include <string_view>

namespace cim {

/** A letter A to Z in lower case; any other character unchanged. */
constexpr char lower(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

/** Whether two names are the same: the case of the letters A to Z is ignored, in every locale. */
inline bool sameName(std::string_view left, std::string_view right) {
    const auto sameLetter = [](char a, char b) { return lower(a) == lower(b); };
    return left.size() == right.size() &&
           (left == right || std::equal(left.begin(), left.end(), right.begin(), sameLetter));
}

/** The element of a container whose member `name` is the same name, ignoring letter case; null if there is none. */
template <class Elements>
auto* findNamed(Elements& elements, std::string_view name) {
    const auto found = std::find_if(std::begin(elements), std::end(elements),
                                    [&](const auto& each) { return sameName(each.name, name); });
    return found == std::end(elements) ? nullptr : &*found;
}

/** The name in lower case, for use as a key. */
std::string foldedName(std::string_view name);

/** Hash of a name that ignores letter case. */
struct NameHash {
    std::size_t operator()(std::string_view name) const;
};

struct NameEqual {
    bool operator()(std::string_view left, std::string_view right) const { return sameName(left, right); }
};

/** Order of names that ignores letter case. */
struct NameLess {
    using is_transparent = void;
    bool operator()(std::string_view left, std::string_view right) const;
};

/** Whether a string is a CIM name: a letter or underscore, then letters, digits and underscores. */
bool isName(std::string_view string);

}  // namespace cim
