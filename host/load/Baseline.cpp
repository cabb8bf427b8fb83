#include "load/Baseline.h"

#include <algorithm>

#include "load/Requests.h"
#include "operations/Interpretation.h"
#include "schema/ObjectPathText.h"

namespace cimhost::load {
namespace {

bool givesPaths(Operation operation) {
    return operation == Operation::enumerateInstanceNames || operation == Operation::associatorNames ||
           operation == Operation::referenceNames;
}

/** A beginning that no identifier there is has. */
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

Answer<std::vector<Instance>> listed(const Answer<std::vector<RawAnswer>>& answers, Operation operation) {
    if (!givesPaths(operation)) {
        return resultsOf<Instance>(answers, operation);
    }
    Answer<std::vector<ObjectPath>> paths = resultsOf<ObjectPath>(answers, operation);
    std::vector<Instance> instances;
    for (ObjectPath& path : paths.value) {
        instances.push_back({std::move(path), {}});
    }
    return {paths.status, std::move(instances)};
}

Answer<std::vector<std::string>> associated(const Answer<std::vector<RawAnswer>>& answers, Operation operation,
                                            const std::string& prefix) {
    const Answer<std::vector<Instance>> found = listed(answers, operation);
    std::vector<std::string> paths;
    for (const Instance& instance : found.value) {
        std::string path = formatObjectPath(instance.path);
        if (path.find(prefix) == std::string::npos) {
            paths.push_back(std::move(path));
        }
    }
    std::sort(paths.begin(), paths.end());
    return {found.status, std::move(paths)};
}

Answer<Baseline> takeBaseline(ObjectManager& manager, const Plan& plan) {
    Baseline baseline;
    const auto names = Operation::enumerateInstanceNames;
    for (const LoadClass& each : plan.classes) {
        const Answer<std::vector<Instance>> found = listed(manager.run(classRequest(names, each)), names);
        if (!found.ok()) {
            return {found.status, {}};
        }
        std::set<std::string>& ids = baseline.ids.emplace_back();
        for (const Instance& instance : found.value) {
            ids.insert(each.idIn(instance.path.keys).value_or(std::string{}));
        }
    }
    baseline.prefix = freePrefix(plan, baseline.ids);
    for (std::size_t i = 0; plan.source && i < associationOperations.size(); ++i) {
        const Operation operation = associationOperations[i];
        const auto found = associated(manager.run(associationRequest(operation, plan)), operation, baseline.prefix);
        if (!found.ok() && found.status.rc != CMPI_RC_ERR_NOT_SUPPORTED) {
            return {found.status, {}};
        }
        baseline.associated[i] = {found.status.rc, found.value};
    }
    return {{}, std::move(baseline)};
}

}  // namespace cimhost::load
