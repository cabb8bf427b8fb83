#include "cim/Names.h"

#include <algorithm>

namespace cim {
namespace {

bool startsName(char c) {
    return (lower(c) >= 'a' && lower(c) <= 'z') || c == '_';
}

bool continuesName(char c) {
    return startsName(c) || (c >= '0' && c <= '9');
}

}  // namespace

std::string foldedName(std::string_view name) {
    std::string folded(name);
    std::transform(folded.begin(), folded.end(), folded.begin(), lower);
    return folded;
}

std::size_t NameHash::operator()(std::string_view name) const {
    std::size_t hash = 0;
    for (const char c : name) {
        hash = hash * 31 + static_cast<unsigned char>(lower(c));
    }
    return hash;
}

bool NameLess::operator()(std::string_view left, std::string_view right) const {
    return std::lexicographical_compare(left.begin(), left.end(), right.begin(), right.end(),
                                        [](char a, char b) { return lower(a) < lower(b); });
}

bool isName(std::string_view string) {
    return !string.empty() && startsName(string.front()) && std::all_of(string.begin(), string.end(), continuesName);
}

}  // namespace cim
