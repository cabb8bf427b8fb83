#include "operations/RequestRunner.h"

#include <stdexcept>

#include "broker/Convert.h"

namespace cimhost {
namespace {

constexpr CMPIStatus notSupported{CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

/** Calls a function of a table unless it is null. */
template <class Function, class... Arguments>
CMPIStatus callEntry(Function* function, Arguments... arguments) {
    return function == nullptr ? notSupported : function(arguments...);
}

const char* charactersOf(const std::optional<std::string>& name) {
    return name ? name->c_str() : nullptr;
}

[[noreturn]] void wrongInterface(Operation operation) {
    throw std::invalid_argument(std::string("not an operation of this interface: ") + nameOf(operation));
}

bool takesInstance(Operation operation) {
    return operation == Operation::createInstance || operation == Operation::modifyInstance;
}

CMPIStatus call(CMPIInstanceMI* interface, const Request& request, RequestScope& scope, const CMPIContext* context,
                const CMPIResult* result) {
    const CMPIInstance* instance = takesInstance(request.operation) ? scope.instance(request.instance) : nullptr;
    return callOperation(interface, request, context, result, scope.objectPath(request.path), instance);
}

CMPIStatus call(CMPIAssociationMI* interface, const Request& request, RequestScope& scope, const CMPIContext* context,
                const CMPIResult* result) {
    return callOperation(interface, request, context, result, scope.objectPath(request.path));
}

template <class Interface>
ProviderResponse run(Broker& broker, Interface* interface, Request request, const ManagerBehaviour& behaviour) {
    ProviderResponse response;
    behaviour.adapt(request, broker);
    behaviour.onRequestThread([&] {
        response = runCall(
            broker, request.context,
            [&](RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
                return call(interface, request, scope, context, result);
            },
            behaviour.resultRules(request.operation));
    });
    response.crashReason = behaviour.crashReason(response, request.operation);
    return response;
}

}  // namespace

CMPIStatus callOperation(CMPIInstanceMI* interface, const Request& request, const CMPIContext* context,
                         const CMPIResult* result, const CMPIObjectPath* path, const CMPIInstance* instance) {
    CPropertyList list(request.properties);
    const char** properties = list.get();
    const auto& table = *interface->ft;
    switch (request.operation) {
        case Operation::enumerateInstances:
            return callEntry(table.enumerateInstances, interface, context, result, path, properties);
        case Operation::enumerateInstanceNames:
            return callEntry(table.enumerateInstanceNames, interface, context, result, path);
        case Operation::getInstance:
            return callEntry(table.getInstance, interface, context, result, path, properties);
        case Operation::createInstance:
            return callEntry(table.createInstance, interface, context, result, path, instance);
        case Operation::modifyInstance:
            return callEntry(table.modifyInstance, interface, context, result, path, instance, properties);
        case Operation::execQuery:
            return callEntry(table.execQuery, interface, context, result, path, request.language.c_str(),
                             request.query.c_str());
        case Operation::deleteInstance:
            return callEntry(table.deleteInstance, interface, context, result, path);
        default:
            wrongInterface(request.operation);
    }
}

CMPIStatus callOperation(CMPIAssociationMI* interface, const Request& request, const CMPIContext* context,
                         const CMPIResult* result, const CMPIObjectPath* path) {
    CPropertyList list(request.properties);
    const char** properties = list.get();
    const auto& table = *interface->ft;
    const char* associationClass = charactersOf(request.filter.associationClass);
    const char* resultClass = charactersOf(request.filter.resultClass);
    const char* role = charactersOf(request.filter.role);
    const char* resultRole = charactersOf(request.filter.resultRole);
    switch (request.operation) {
        case Operation::associators:
            return callEntry(table.associators, interface, context, result, path, associationClass, resultClass, role,
                             resultRole, properties);
        case Operation::associatorNames:
            return callEntry(table.associatorNames, interface, context, result, path, associationClass, resultClass,
                             role, resultRole);
        case Operation::references:
            return callEntry(table.references, interface, context, result, path, resultClass, role, properties);
        case Operation::referenceNames:
            return callEntry(table.referenceNames, interface, context, result, path, resultClass, role);
        default:
            wrongInterface(request.operation);
    }
}

ProviderResponse runRequest(Broker& broker, CMPIInstanceMI* interface, Request request,
                            const ManagerBehaviour& behaviour) {
    if (request.operation > Operation::execQuery) {
        wrongInterface(request.operation);
    }
    return run(broker, interface, std::move(request), behaviour);
}

ProviderResponse runRequest(Broker& broker, CMPIAssociationMI* interface, Request request,
                            const ManagerBehaviour& behaviour) {
    if (!isAssociationOperation(request.operation)) {
        wrongInterface(request.operation);
    }
    return run(broker, interface, std::move(request), behaviour);
}

}  // namespace cimhost
