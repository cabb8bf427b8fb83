#include "Schema.h"

#include <algorithm>

namespace gate {

namespace {

char lower(char letter) {
    return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

template <class Range>
auto findNamed(const Range& range, std::string_view name) {
    const auto found =
        std::find_if(range.begin(), range.end(), [&](const auto& each) { return sameName(each.name, name); });
    return found == range.end() ? nullptr : found;
}

}  // namespace

bool sameName(std::string_view left, std::string_view right) {
    return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                      [](char one, char other) { return lower(one) == lower(other); });
}

const Class* findClass(std::string_view name) {
    return findNamed(Classes(), name);
}

const Property* findProperty(const Class& owner, std::string_view name) {
    return findNamed(owner, name);
}

}  // namespace gate
