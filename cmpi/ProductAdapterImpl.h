#pragma once

// Definitions of ProductAdapter. Included by the source file of each adapter and nowhere else, so that
// each adapter's code and trace buffers stand in its own unit.

#include "KO/ProviderUtilities.h"
#include "ProductAdapter.h"
#include "PropertyTable.h"
#include "Trace.h"

#include <utility>

namespace KO::LeaseWarrantyProvider {

namespace {
constexpr const char* keyValueName = "l_keyValue";
}  // namespace

template <class Policy>
ProductAdapter<Policy>::ProductAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                       std::string requestNameSpace)
    : broker(requestBroker), context(requestContext), nameSpace(std::move(requestNameSpace)) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::constructor), label::broker, broker, label::context,
                        context);
}

template <class Policy>
ProductAdapter<Policy>::ProductAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                       const CMPIObjectPath* path)
    : broker(requestBroker), context(requestContext), nameSpace(ProviderUtilities::getNamespace(path)) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::constructor), label::broker, broker, label::context,
                        context, label::objectPath, path);
    setObjectPath(path);
}

template <class Policy>
ProductAdapter<Policy>::~ProductAdapter() {
    const Traced traced(at(Policy::unit, Level::flow, Policy::destructor));
}

template <class Policy>
ProductAdapter<Policy>::operator bool() {
    const Traced traced(at(Policy::unit));
    return element;
}

template <class Policy>
void ProductAdapter<Policy>::operator++() {
    const Traced traced(at(Policy::unit));
    ++element;
}

template <class Policy>
void ProductAdapter<Policy>::setObjectPath(const CMPIObjectPath* path) {
    const Traced traced(at(Policy::unit), label::objectPath, path);
    if (ProviderUtilities::getKeyCount(path) == 0) {
        return;
    }
    for (const auto& filter : Policy::filters) {
        std::string value;
        if (ProviderUtilities::getKeyProperty(path, filter.name, value)) {
            traceVariable(at(Policy::unit), keyValueName, value);
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
