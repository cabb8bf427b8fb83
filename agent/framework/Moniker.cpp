#include "KO/Moniker.h"

#include <optional>
#include <utility>
#include <vector>

namespace KO {

struct Moniker::Implementation {
    std::vector<std::pair<std::string, std::string>> keys;
    std::optional<std::size_t> selected;
};

Moniker::Moniker() : implementation(std::make_unique<Implementation>()) {}
Moniker::Moniker(const Moniker& other) : implementation(std::make_unique<Implementation>(*other.implementation)) {}
Moniker::~Moniker() = default;

Moniker& Moniker::operator=(const Moniker& other) {
    Implementation copy = *other.implementation;
    *implementation = std::move(copy);
    return *this;
}

unsigned int Moniker::getKeyCount() const {
    return static_cast<unsigned int>(implementation->keys.size());
}

bool Moniker::selectKey(unsigned int index) {
    if (index >= implementation->keys.size()) {
        return false;
    }
    implementation->selected = index;
    return true;
}

bool Moniker::getName(std::string& name) const {
    if (!implementation->selected) {
        return false;
    }
    name = implementation->keys[*implementation->selected].first;
    return true;
}

bool Moniker::getValue(std::string& value) const {
    if (!implementation->selected) {
        return false;
    }
    value = implementation->keys[*implementation->selected].second;
    return true;
}

void Moniker::addKey(std::string name, const std::string& value) {
    implementation->keys.emplace_back(std::move(name), value);
}

}  // namespace KO
