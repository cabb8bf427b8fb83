#include "model/Request.h"

namespace cimhost {
namespace {

constexpr const char* names[] = {"EnumerateInstances", "EnumerateInstanceNames",
                                 "GetInstance",        "CreateInstance",
                                 "ModifyInstance",     "DeleteInstance",
                                 "ExecQuery",          "Associators",
                                 "AssociatorNames",    "References",
                                 "ReferenceNames",     "InvokeMethod",
                                 "SetProperty",        "GetProperty"};

}  // namespace

const char* nameOf(Operation operation) {
    return names[static_cast<std::size_t>(operation)];
}

bool isAssociationOperation(Operation operation) {
    return operation >= Operation::associators && operation <= Operation::referenceNames;
}

bool isReferenceOperation(Operation operation) {
    return operation == Operation::references || operation == Operation::referenceNames;
}

bool returnsPaths(Operation operation) {
    return operation == Operation::enumerateInstanceNames || operation == Operation::createInstance ||
           operation == Operation::associatorNames || operation == Operation::referenceNames;
}

Request Request::with(ContextEntries entries) const {
    Request request = *this;
    request.context = std::move(entries);
    return request;
}

}  // namespace cimhost
