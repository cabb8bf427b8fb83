#include "Operations.h"

namespace gate {

namespace {

ProviderSession::Paths namesOf(const Request& request, const Class& requested) {
    const ProviderSession session(request);
    return session.names(LocalObjectPath(nameSpaceOf(request.path), requested));
}

ProviderSession::Instances instancesOf(const Request& request, const Class& requested, const char** properties) {
    const ProviderSession session(request);
    const PropertyList list(properties, requested);
    ProviderSession::Instances instances = session.instances(LocalObjectPath(nameSpaceOf(request.path), requested));
    for (const CMPIInstance*& instance : instances) {
        instance = list.applied(session.broker(), instance);
    }
    return instances;
}

const CMPIInstance* instanceAt(const Request& request, const Class& requested, const char** properties) {
    const ProviderSession session(request);
    const CMPIInstance* instance = session.get(localPath(request.path, requested), requested);
    return PropertyList(properties, requested).applied(session.broker(), instance);
}

}  // namespace

void enumerateInstanceNames(const Request& request) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return enumerateAssociationNames(request, requested);
    }
    request.give(namesOf(request, requested));
}

void enumerateInstances(const Request& request, const char** properties) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return enumerateAssociations(request, requested);
    }
    request.give(instancesOf(request, requested, properties));
}

void getInstance(const Request& request, const char** properties) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return getAssociation(request, requested);
    }
    request.give(std::vector{instanceAt(request, requested, properties)});
}

}  // namespace gate
