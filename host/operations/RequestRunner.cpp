#include "operations/RequestRunner.h"

#include <stdexcept>

#include "broker/PropertyLists.h"
#include "operations/HandedOver.h"
#include "operations/RequestThread.h"

namespace cimhost {
namespace {

constexpr CMPIStatus notSupported{CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

/** Calls a function of a table, if it is there. */
template <class Function, class... Arguments>
CMPIStatus callEntry(Function* function, Arguments... arguments) {
    return function == nullptr ? notSupported : function(arguments...);
}

const char* textOf(const std::optional<std::string>& text) {
    return text ? text->c_str() : nullptr;
}

[[noreturn]] void wrongInterface(Operation operation) {
    throw std::invalid_argument(std::string("not an operation of this interface: ") + nameOf(operation));
}

/** What the manager insists on in the answer to an operation. */
ResultRules rulesOf(const Profile& profile, Operation operation) {
    const bool creates = operation == Operation::createInstance;
    return {creates && profile.created == CreationResult::pathOnly,
            operation == Operation::getInstance && profile.refusesEmptyGet, creates && profile.keepsReturnedPath};
}

CMPIStatus call(CMPIInstanceMI* interface, const Request& request, RequestScope& scope, const CMPIContext* context,
                const CMPIResult* result) {
    CPropertyList list(request.properties);
    const char** properties = list.get();
    const CMPIObjectPath* path = scope.objectPath(request.path);
    const auto& table = *interface->ft;
    switch (request.operation) {
        case Operation::enumerateInstances:
            return callEntry(table.enumerateInstances, interface, context, result, path, properties);
        case Operation::enumerateInstanceNames:
            return callEntry(table.enumerateInstanceNames, interface, context, result, path);
        case Operation::getInstance:
            return callEntry(table.getInstance, interface, context, result, path, properties);
        case Operation::createInstance:
            return callEntry(table.createInstance, interface, context, result, path, scope.instance(request.instance));
        case Operation::modifyInstance:
            return callEntry(table.modifyInstance, interface, context, result, path, scope.instance(request.instance),
                             properties);
        case Operation::execQuery:
            return callEntry(table.execQuery, interface, context, result, path, request.language.c_str(),
                             request.query.c_str());
        default:
            return callEntry(table.deleteInstance, interface, context, result, path);
    }
}

CMPIStatus call(CMPIAssociationMI* interface, const Request& request, RequestScope& scope, const CMPIContext* context,
                const CMPIResult* result) {
    CPropertyList list(request.properties);
    const char** properties = list.get();
    const CMPIObjectPath* path = scope.objectPath(request.path);
    const auto& table = *interface->ft;
    const char* associationClass = textOf(request.filter.associationClass);
    const char* resultClass = textOf(request.filter.resultClass);
    const char* role = textOf(request.filter.role);
    const char* resultRole = textOf(request.filter.resultRole);
    switch (request.operation) {
        case Operation::associators:
            return callEntry(table.associators, interface, context, result, path, associationClass, resultClass, role,
                             resultRole, properties);
        case Operation::associatorNames:
            return callEntry(table.associatorNames, interface, context, result, path, associationClass, resultClass,
                             role, resultRole);
        case Operation::references:
            return callEntry(table.references, interface, context, result, path, resultClass, role, properties);
        default:
            return callEntry(table.referenceNames, interface, context, result, path, resultClass, role);
    }
}

template <class Interface>
RawAnswer run(Broker& broker, Interface* interface, const Request& request) {
    return onRequestThread(broker, [&] {
        return runCall(
            broker, request.context,
            [&](RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
                return call(interface, request, scope, context, result);
            },
            rulesOf(broker.profile(), request.operation));
    });
}

template <class Interface>
RawAnswer runAsManager(Broker& broker, Interface* interface, const Request& request) {
    return broker.profile().manager == Manager::standard ? run(broker, interface, request)
                                                         : run(broker, interface, handedOver(request, broker));
}

}  // namespace

RawAnswer runRequest(Broker& broker, CMPIInstanceMI* interface, const Request& request) {
    if (isAssociationOperation(request.operation)) {
        wrongInterface(request.operation);
    }
    return runAsManager(broker, interface, request);
}

RawAnswer runRequest(Broker& broker, CMPIAssociationMI* interface, const Request& request) {
    if (!isAssociationOperation(request.operation)) {
        wrongInterface(request.operation);
    }
    return runAsManager(broker, interface, request);
}

}  // namespace cimhost
