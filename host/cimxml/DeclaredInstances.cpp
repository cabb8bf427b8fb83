#include "cimxml/DeclaredInstances.h"

#include <algorithm>

#include "broker/NamedValues.h"
#include "cim/Names.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

namespace cimhost::cimxml {
namespace {

bool haveSameKeys(const ObjectPath& left, const ObjectPath& right) {
    return left.keys.size() == right.keys.size() &&
           std::all_of(left.keys.begin(), left.keys.end(), [&](const NamedValue& key) {
               const NamedValue* other = findNamed(right.keys, key.name);
               return other != nullptr && formatMof(key.value) == formatMof(other->value);
           });
}

}  // namespace

std::vector<Instance> DeclaredInstances::instancesOf(const ObjectPath& path) const {
    std::vector<Instance> found;
    for (Instance instance : schema.instances()) {
        if (cim::sameName(instance.path.className, path.className)) {
            instance.path.nameSpace = path.nameSpace;
            found.push_back(std::move(instance));
        }
    }
    return found;
}

Response DeclaredInstances::getInstance(const ObjectPath& path) const {
    for (const Instance& instance : instancesOf(path)) {
        if (haveSameKeys(instance.path, path)) {
            return Response::ofInstances({instance});
        }
    }
    return Response::failed({CMPI_RC_ERR_NOT_FOUND, "There is no instance " + formatObjectPath(path) + "."});
}

Response DeclaredInstances::perform(Request request) {
    switch (request.operation) {
        case Operation::enumerateInstances:
            return Response::ofInstances(instancesOf(request.path));
        case Operation::enumerateInstanceNames: {
            Response response;
            for (Instance& instance : instancesOf(request.path)) {
                response.paths.push_back(std::move(instance.path));
            }
            return response;
        }
        case Operation::getInstance:
            return getInstance(request.path);
        case Operation::associators:
        case Operation::associatorNames:
        case Operation::references:
        case Operation::referenceNames:
            return {};
        default:
            return notSupported(request.operation);
    }
}

}  // namespace cimhost::cimxml
