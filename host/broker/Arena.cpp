#include "broker/Arena.h"

#include <algorithm>
#include <iterator>

namespace cimhost {

const void* Arena::mark() {
    const std::lock_guard<std::mutex> lock(mutex);
    marks.push_back(std::make_unique<std::size_t>(objects.size()));
    return marks.back().get();
}

bool Arena::releaseMark(const void* mark) {
    const std::lock_guard<std::mutex> lock(mutex);
    const auto found = std::find_if(marks.begin(), marks.end(), [&](const auto& each) { return each.get() == mark; });
    if (found == marks.end()) {
        return false;
    }
    const auto since = std::next(objects.begin(), static_cast<std::ptrdiff_t>(**found));
    objects.erase(std::stable_partition(since, objects.end(), [](const auto& object) { return object->isClone; }),
                  objects.end());
    marks.erase(found, marks.end());
    return true;
}

void Arena::takeFrom(Arena& other, const Object& object) {
    if (std::unique_ptr<Object> moved = other.disown(object)) {
        adopt(std::move(moved));
    }
}

std::unique_ptr<Object> Arena::disown(const Object& object) {
    const std::lock_guard<std::mutex> lock(mutex);
    const auto found =
        std::find_if(objects.rbegin(), objects.rend(), [&](const auto& each) { return each.get() == &object; });
    if (found == objects.rend()) {
        return nullptr;
    }
    std::unique_ptr<Object> disowned = std::move(*found);
    objects.erase(std::next(found).base());
    return disowned;
}

std::size_t Arena::size() const {
    const std::lock_guard<std::mutex> lock(mutex);
    return objects.size();
}

void Arena::adopt(std::unique_ptr<Object> object) {
    const std::lock_guard<std::mutex> lock(mutex);
    objects.push_back(std::move(object));
}

}  // namespace cimhost
