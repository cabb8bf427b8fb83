#pragma once

#include <optional>
#include <string>
#include <vector>

#include "lab/load/Plan.h"
#include "model/Request.h"

// The requests of a load.

namespace cimhost::lab {

inline Request createRequest(const LoadClass& known, const std::string& id, const std::vector<NamedValue>& values) {
    const ObjectPath path = known.instancePath(id);
    Instance instance{path, path.keys};
    instance.properties.insert(instance.properties.end(), values.begin(), values.end());
    return Request::createInstance(path, std::move(instance));
}

inline Request modifyRequest(const LoadClass& known, const std::string& id, const std::vector<NamedValue>& values,
                             bool listsChanges) {
    const ObjectPath path = known.instancePath(id);
    Request request = Request::modifyInstance(path, {path, values});
    if (listsChanges) {
        std::vector<std::string>& names = request.properties.emplace();
        for (const NamedValue& each : values) {
            names.push_back(each.name);
        }
    }
    return request;
}

/** An association operation for the plan's source. */
inline Request associationRequest(Operation operation, const Plan& plan) {
    Request request;
    request.operation = operation;
    request.path = *plan.source;
    (isReferenceOperation(operation) ? request.filter.resultClass : request.filter.associationClass) =
        plan.associationClass;
    return request;
}

}  // namespace cimhost::lab
