#include "cli/ClassList.h"

#include <algorithm>

namespace cimhost {

std::vector<ListedClass> listClasses(const Schema& schema, const std::vector<ProviderRegistration>& registrations) {
    std::vector<ListedClass> list;
    for (const Class* each : schema.classes()) {
        list.push_back({each->name, each});
    }
    for (const ProviderRegistration& registration : registrations) {
        const auto same = [&](const ListedClass& each) { return sameName(each.name, registration.className); };
        auto listed = std::find_if(list.begin(), list.end(), same);
        if (listed == list.end()) {
            listed = list.insert(list.end(), {registration.className});
        }
        listed->providers.push_back(registration);
    }
    return list;
}

}  // namespace cimhost
