#pragma once

#include <optional>
#include <string>
#include <vector>

#include "load/Plan.h"
#include "operations/Request.h"

// The requests of a load.

namespace cimhost::load {

inline Request createRequest(const LoadClass& known, const std::string& id, const std::vector<NamedValue>& values) {
    Request request;
    request.operation = Operation::createInstance;
    request.path = known.instancePath(id);
    request.instance = {request.path, request.path.keys};
    request.instance.properties.insert(request.instance.properties.end(), values.begin(), values.end());
    return request;
}

inline Request modifyRequest(const LoadClass& known, const std::string& id, const std::vector<NamedValue>& values,
                             bool listsChanges) {
    Request request;
    request.operation = Operation::modifyInstance;
    request.path = known.instancePath(id);
    request.instance = {request.path, values};
    if (listsChanges) {
        std::vector<std::string>& names = request.properties.emplace();
        for (const NamedValue& each : values) {
            names.push_back(each.name);
        }
    }
    return request;
}

/** Get or delete. */
inline Request instanceRequest(Operation operation, const LoadClass& known, const std::string& id) {
    Request request;
    request.operation = operation;
    request.path = known.instancePath(id);
    return request;
}

/** An enumeration, of instances or names. */
inline Request classRequest(Operation operation, const LoadClass& known) {
    Request request;
    request.operation = operation;
    request.path = known.path;
    return request;
}

/** One of the association operations, from the plan's source. */
inline Request associationRequest(Operation operation, const Plan& plan) {
    Request request;
    request.operation = operation;
    request.path = *plan.source;
    const bool isReference = operation == Operation::references || operation == Operation::referenceNames;
    (isReference ? request.filter.resultClass : request.filter.associationClass) = plan.associationClass;
    return request;
}

}  // namespace cimhost::load
