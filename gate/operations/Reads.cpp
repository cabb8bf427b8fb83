#include "Operations.h"

namespace gate {

namespace {

// Functions that end the session before its answer is returned.

Paths namesOf(const ClientRequest& request, const Class& requested) {
    return ProviderSession(request).names(requested);
}

Instances instancesOf(const ClientRequest& request, const Class& requested, const char** properties) {
    const ProviderSession session(request);
    const PropertySelection selection(properties, requested);
    Instances instances = session.instances(requested);
    for (const CMPIInstance*& instance : instances) {
        instance = selection.applied(session.broker(), instance);
    }
    return instances;
}

const CMPIInstance* instanceAt(const ClientRequest& request, const Class& requested, const char** properties) {
    const ProviderSession session(request);
    const CMPIInstance* instance = session.get(localPath(request.path, requested), requested);
    return PropertySelection(properties, requested).applied(session.broker(), instance);
}

}  // namespace

void enumerateInstanceNames(const ClientRequest& request) {
    const Class& requested = request.requestedClass();
    request.give(requested.isAssociation ? associationPaths(request, requested) : namesOf(request, requested));
}

void enumerateInstances(const ClientRequest& request, const char** properties) {
    const Class& requested = request.requestedClass();
    request.give(requested.isAssociation ? associationInstances(request, requested)
                                         : instancesOf(request, requested, properties));
}

void getInstance(const ClientRequest& request, const char** properties) {
    const Class& requested = request.requestedClass();
    request.give(Instances{requested.isAssociation ? associationAt(request, requested)
                                                   : instanceAt(request, requested, properties)});
}

}  // namespace gate
