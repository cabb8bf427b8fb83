#pragma once

// Definitions of ProductAdapter. Included by the source file of each adapter and nowhere else, so that
// each adapter's code and trace buffers stand in its own unit.

#include "ElementAdapterImpl.h"
#include "KO/ProviderUtilities.h"
#include "ProductAdapter.h"
#include "PropertyTable.h"
#include "Trace.h"

#include <string>

namespace KO::LeaseWarrantyProvider {

namespace {
constexpr const char* keyValueName = "l_keyValue";
}  // namespace

template <class Policy>
ProductAdapter<Policy>::ProductAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                       const CMPIObjectPath* path)
    : ElementAdapter<Policy>(requestBroker, requestContext, path, &narrow) {}

template <class Policy>
void ProductAdapter<Policy>::setObjectPath(const CMPIObjectPath* path) {
    narrow(element, path);
}

template <class Policy>
void ProductAdapter<Policy>::narrow(typename Policy::Element& element, const CMPIObjectPath* path) {
    const Traced traced(at(Policy::unit, Level::flow, "setObjectPath"));
    if (ProviderUtilities::getKeyCount(path) == 0) {
        return;
    }
    for (const auto& filter : Policy::filters) {
        std::string value;
        if (ProviderUtilities::getKeyProperty(path, filter.name, value)) {
            traceVariable(at(Policy::unit, Level::flow, "setObjectPath"), keyValueName, value);
            element.setFilter(filter.type, value);
        }
    }
}

template <class Policy>
CMPIObjectPath* ProductAdapter<Policy>::getObjectPath() {
    const Traced traced(at(Policy::unit));
    CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, Policy::className, nameSpace);
    if (path == nullptr) {
        return nullptr;
    }
    std::string value;
    for (const auto& key : Policy::keys) {
        key.read(element, value);
        traceVariable(at(Policy::unit), keyValueName, value);
        ProviderUtilities::setKeyProperty(path, key.name, value);
    }
    return path;
}

template <class Policy>
CMPIInstance* ProductAdapter<Policy>::getCMPIInstance(const char** properties) {
    const Traced traced(at(Policy::unit), label::properties, properties);
    CMPIInstance* instance = ProviderUtilities::createInstance(broker, getObjectPath());
    if (instance != nullptr) {
        fillInstance(Policy::properties, element, broker, instance);
    }
    return instance;
}

template <class Policy>
template <class ModifiablePolicy>
void ProductAdapter<Policy>::modifyCMPIInstance(const CMPIInstance* referenceInstance, const char** properties) {
    // Named here, since the compiler's name of a function template carries its argument.
    const Traced traced(at(Policy::unit, Level::flow, "modifyCMPIInstance"), label::referenceInstance,
                        referenceInstance, label::propertiesBare, properties);
    if (referenceInstance != nullptr) {
        ModifiablePolicy::modify(element, referenceInstance);
    }
}

}  // namespace KO::LeaseWarrantyProvider
