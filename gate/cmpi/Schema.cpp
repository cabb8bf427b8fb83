#include "Schema.h"

#include <algorithm>

namespace gate {

namespace {

template <class Range>
auto findNamed(const Range& range, std::string_view name) {
    const auto found =
        std::find_if(range.begin(), range.end(), [&](const auto& each) { return sameName(each.name, name); });
    return found == range.end() ? nullptr : found;
}

}  // namespace

const Class* findClass(std::string_view name) {
    return findNamed(Classes(), name);
}

const Property* findProperty(const Class& owner, std::string_view name) {
    return findNamed(owner, name);
}

}  // namespace gate
