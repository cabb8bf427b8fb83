#include "lab/load/ExpectedState.h"

#include <algorithm>

namespace cimhost::lab {

void ExpectedState::created(const std::string& id, const Values& values) {
    known.emplace(id, values);
    ids.push_back(id);
}

void ExpectedState::modified(const std::string& id, const Values& values) {
    Values& target = known.at(id);
    for (const auto& [name, value] : values) {
        target[name] = value;
    }
}

void ExpectedState::removed(const std::string& id) {
    forget(id);
}

void ExpectedState::doubt(const std::string& id) {
    forget(id);
    doubtful.insert(id);
}

void ExpectedState::add(const ExpectedState& other) {
    for (const auto& [id, values] : other.known) {
        created(id, values);
    }
    doubtful.insert(other.doubtful.begin(), other.doubtful.end());
}

void ExpectedState::forget(const std::string& id) {
    const auto found = std::find(ids.begin(), ids.end(), id);
    if (found != ids.end()) {
        *found = ids.back();
        ids.pop_back();
        known.erase(id);
    }
}

}  // namespace cimhost::lab
