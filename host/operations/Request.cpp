#include "operations/Request.h"

namespace cimhost {
namespace {

constexpr const char* names[] = {"EnumerateInstances", "EnumerateInstanceNames",
                                 "GetInstance",        "CreateInstance",
                                 "ModifyInstance",     "DeleteInstance",
                                 "ExecQuery",          "Associators",
                                 "AssociatorNames",    "References",
                                 "ReferenceNames"};

}  // namespace

const char* nameOf(Operation operation) {
    return names[static_cast<std::size_t>(operation)];
}

bool isAssociationOperation(Operation operation) {
    return operation >= Operation::associators;
}

}  // namespace cimhost
