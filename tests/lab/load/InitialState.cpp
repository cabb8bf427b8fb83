#include "lab/load/InitialState.h"

#include <algorithm>

#include "lab/load/Requests.h"
#include "schema/ObjectPathText.h"

namespace cimhost::lab {
namespace {

/** A prefix that no existing identifier has. */
std::string freePrefix(const Plan& plan, const std::vector<std::set<std::string>>& ids) {
    std::string prefix = "load" + std::to_string(plan.seed) + "-";
    const auto isTaken = [&](const std::set<std::string>& each) {
        const auto next = each.lower_bound(prefix);
        return next != each.end() && next->compare(0, prefix.size(), prefix) == 0;
    };
    while (std::any_of(ids.begin(), ids.end(), isTaken)) {
        prefix.insert(prefix.size() - 1, "x");
    }
    return prefix;
}

}  // namespace

std::vector<Instance> listed(const Response& response) {
    std::vector<Instance> instances = response.instances;
    for (const ObjectPath& path : response.paths) {
        instances.push_back({path, {}});
    }
    return instances;
}

std::vector<std::string> associated(const Response& response, const std::string& prefix) {
    std::vector<std::string> paths;
    for (const Instance& instance : listed(response)) {
        std::string path = formatObjectPath(instance.path);
        if (path.find(prefix) == std::string::npos) {
            paths.push_back(std::move(path));
        }
    }
    std::sort(paths.begin(), paths.end());
    return paths;
}

StatusOr<InitialState> readInitialState(ObjectManager& manager, const Plan& plan) {
    InitialState initial;
    for (const LoadClass& each : plan.classes) {
        const Response found = manager.perform(Request::enumerateInstanceNames(each.path));
        if (!found.ok()) {
            return {found.status, {}};
        }
        std::set<std::string>& ids = initial.ids.emplace_back();
        for (const ObjectPath& path : found.paths) {
            ids.insert(each.idIn(path.keys).value_or(std::string{}));
        }
    }
    initial.prefix = freePrefix(plan, initial.ids);
    for (std::size_t i = 0; plan.source && i < associationOperations.size(); ++i) {
        const Response found = manager.perform(associationRequest(associationOperations[i], plan));
        if (!found.ok() && found.status.rc != CMPI_RC_ERR_NOT_SUPPORTED) {
            return {found.status, {}};
        }
        initial.associated[i] = {found.status.rc, associated(found, initial.prefix)};
    }
    return {{}, std::move(initial)};
}

}  // namespace cimhost::lab
