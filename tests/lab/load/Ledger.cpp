#include "lab/load/Ledger.h"

#include <algorithm>

namespace cimhost::lab {

void Ledger::created(const std::string& id, const Values& values) {
    known.emplace(id, values);
    ids.push_back(id);
}

void Ledger::modified(const std::string& id, const Values& values) {
    Values& target = known.at(id);
    for (const auto& [name, value] : values) {
        target[name] = value;
    }
}

void Ledger::removed(const std::string& id) {
    forget(id);
}

void Ledger::doubt(const std::string& id) {
    forget(id);
    doubtful.insert(id);
}

void Ledger::add(const Ledger& other) {
    for (const auto& [id, values] : other.known) {
        created(id, values);
    }
    doubtful.insert(other.doubtful.begin(), other.doubtful.end());
}

void Ledger::forget(const std::string& id) {
    const auto found = std::find(ids.begin(), ids.end(), id);
    if (found != ids.end()) {
        *found = ids.back();
        ids.pop_back();
        known.erase(id);
    }
}

}  // namespace cimhost::lab
