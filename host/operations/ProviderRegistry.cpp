#include "operations/ProviderRegistry.h"

#include <algorithm>
#include <utility>

#include "cim/Names.h"

namespace cimhost {
namespace {

bool isIn(const ServedClass& entry, std::string_view nameSpace) {
    return cim::sameName(entry.nameSpace, nameSpace);
}

}  // namespace

ProviderRegistry::ProviderRegistry(const std::vector<ProviderRegistration>& registrations) {
    for (const ProviderRegistration& registration : registrations) {
        add(registration);
    }
}

void ProviderRegistry::add(const ProviderRegistration& registration) {
    const ProviderAddress address{registration.location, registration.provider, {}};
    for (const std::string& nameSpace : registration.nameSpaces) {
        if (registration.instance) {
            add({nameSpace, registration.className, InterfaceKind::instance, address});
        }
        if (registration.association) {
            add({nameSpace, registration.className, InterfaceKind::association, address});
        }
    }
}

void ProviderRegistry::add(ServedClass entry) {
    if (const ServedClass* same = find(entry.nameSpace, entry.className, entry.kind)) {
        entries[static_cast<std::size_t>(same - entries.data())] = std::move(entry);
    } else {
        entries.push_back(std::move(entry));
    }
}

std::vector<std::string> ProviderRegistry::nameSpaces() const {
    std::vector<std::string> found;
    for (const ServedClass& each : entries) {
        if (std::none_of(found.begin(), found.end(), [&](const auto& name) { return isIn(each, name); })) {
            found.push_back(each.nameSpace);
        }
    }
    return found;
}

bool ProviderRegistry::knowsNameSpace(std::string_view nameSpace) const {
    return std::any_of(entries.begin(), entries.end(), [&](const ServedClass& each) { return isIn(each, nameSpace); });
}

const ServedClass* ProviderRegistry::find(std::string_view nameSpace, std::string_view className,
                                          InterfaceKind kind) const {
    const auto found = std::find_if(entries.begin(), entries.end(), [&](const ServedClass& each) {
        return each.kind == kind && isIn(each, nameSpace) && cim::sameName(each.className, className);
    });
    return found == entries.end() ? nullptr : &*found;
}

std::vector<const ServedClass*> ProviderRegistry::associations(std::string_view nameSpace) const {
    std::vector<const ServedClass*> found;
    for (const ServedClass& each : entries) {
        if (each.kind == InterfaceKind::association && isIn(each, nameSpace)) {
            found.push_back(&each);
        }
    }
    return found;
}

}  // namespace cimhost
