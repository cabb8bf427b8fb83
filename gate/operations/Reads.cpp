#include <algorithm>

#include "Operations.h"

namespace gate {

void requireProperty(const Class& requested, std::string_view name) {
    failIf(cim::findNamed(requested, name) == nullptr, CMPI_RC_ERR_NO_SUCH_PROPERTY, requested.name,
           " has no property ", name, ".");
}

PropertySelection::PropertySelection(const char** list, const Class& itsClass)
    : requested(itsClass), isComplete(list == nullptr) {
    for (const char** name = list; list != nullptr && *name != nullptr; ++name) {
        names.push_back(*name);
    }
    isComplete =
        std::all_of(requested.begin(), requested.end(), [&](const Property& property) { return has(property); });
}

bool PropertySelection::has(const Property& property) const {
    return isComplete ||
           std::any_of(names.begin(), names.end(), [&](const char* name) { return sameName(name, property.name); });
}

void PropertySelection::requireKnown() const {
    for (const char* name : names) {
        requireProperty(requested, name);
    }
}

const CMPIInstance* PropertySelection::applied(const CMPIBroker* broker, const CMPIInstance* instance) const {
    if (isComplete) {
        return instance;
    }
    CMPIInstance* made = makeInstance(broker, pathOf(instance));
    // Some managers put all properties of the class into a new instance; the filter removes those not selected. It also
    // lists the keys as properties, since some managers hide properties that are only named as keys.
    std::vector<const char*> keys;
    for (const Property& property : requested) {
        keys.insert(keys.end(), property.isKey ? 1 : 0, property.name);
    }
    std::vector<const char*> shown = keys;
    shown.insert(shown.end(), names.begin(), names.end());
    keys.push_back(nullptr);
    shown.push_back(nullptr);
    tell<&CMPIInstanceFT::setPropertyFilter>(made, shown.data(), keys.data());
    for (const Property& property : requested) {
        const auto answer = ask<&CMPIInstanceFT::getProperty>(instance, property.name);
        require(answer.isOk() || isAbsent(answer.status), "return the value of a property", answer.status);
        const bool isPresent = answer.isOk() && (answer.value.state & (CMPI_notFound | CMPI_badValue)) == 0;
        if (isPresent && (property.isKey || has(property))) {
            const CMPIValue* value = cim::hasValue(answer.value) ? &answer.value.value : nullptr;
            setProperty(made, property.name, value, answer.value.type);
        }
    }
    return made;
}

namespace {

// These functions end their session before the results are returned to the client.

Instances instancesOf(const ClientRequest& request, const Class& requested, const char** properties) {
    const ProviderSession session(request);
    const PropertySelection selection(properties, requested);
    Instances instances = session.instances(requested);
    for (const CMPIInstance*& instance : instances) {
        instance = selection.applied(request.broker(), instance);
    }
    return instances;
}

const CMPIInstance* instanceAt(const ClientRequest& request, const Class& requested, const char** properties) {
    const ProviderSession session(request);
    const CMPIInstance* instance = session.get(localPath(request.path, requested), requested);
    return PropertySelection(properties, requested).applied(request.broker(), instance);
}

}  // namespace

void enumerateInstanceNames(const ClientRequest& request) {
    const Class& requested = request.requestedClass();
    const Paths paths =
        requested.isAssociation ? associationPaths(request, requested) : ProviderSession(request).names(requested);
    request.returnResults(paths);  // after the session
}

void enumerateInstances(const ClientRequest& request, const char** properties) {
    const Class& requested = request.requestedClass();
    request.returnResults(requested.isAssociation ? associationInstances(request, requested)
                                                  : instancesOf(request, requested, properties));
}

void getInstance(const ClientRequest& request, const char** properties) {
    const Class& requested = request.requestedClass();
    request.returnResults(Instances{requested.isAssociation ? associationAt(request, requested)
                                                            : instanceAt(request, requested, properties)});
}

}  // namespace gate
