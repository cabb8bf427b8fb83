#pragma once

// Definitions of RecordAdapter. Included by the source file of each adapter and nowhere else, so that
// each adapter's code and trace buffers stand in its own unit.

#include "ElementAdapterImpl.h"
#include "KO/Instrumentation.h"
#include "KO/ProviderUtilities.h"
#include "PropertyTable.h"
#include "RecordAdapter.h"
#include "Trace.h"
#include "cim/CmpiAccess.h"

#include <cmpift.h>

#include <optional>
#include <string>

namespace KO::LeaseWarrantyProvider {

namespace {

constexpr const char* instanceIdKey = "InstanceID";

/** The characters of a path's string key; nothing when the broker gives anything else. */
std::optional<std::string> stringKey(const CMPIObjectPath* path, const char* name) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIData key = path->ft->getKey(path, name, &status);
    const bool isString = cim::hasValue(key) && key.type == CMPI_string;
    if (status.rc != CMPI_RC_OK || !isString || key.value.string == nullptr) {
        return std::nullopt;
    }
    const char* characters = key.value.string->ft->getCharPtr(key.value.string, &status);
    if (status.rc != CMPI_RC_OK || characters == nullptr) {
        return std::nullopt;
    }
    return characters;
}

}  // namespace

template <class Policy>
RecordAdapter<Policy>::RecordAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                     const CMPIObjectPath* path)
    : ElementAdapter<Policy>(requestBroker, requestContext, path, &narrow) {}

template <class Policy>
void RecordAdapter<Policy>::setObjectPath(const CMPIObjectPath* path) {
    narrow(element, path);
}

template <class Policy>
void RecordAdapter<Policy>::narrow(typename Policy::Element& element, const CMPIObjectPath* path) {
    const Traced traced(at(Policy::unit, Level::flow, "setObjectPath"), label::objectPath, path);
    if (ProviderUtilities::getKeyCount(path) == 0) {
        return;
    }
    if (const auto instanceId = stringKey(path, instanceIdKey)) {
        element.setFilter(Policy::Element::InstanceIDFilter, *instanceId);
    }
}

template <class Policy>
CMPIObjectPath* RecordAdapter<Policy>::getObjectPath() {
    const Traced traced(at(Policy::unit));
    CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, Policy::className, nameSpace);
    std::string instanceId;
    if (path != nullptr && element && element.getInstanceID(instanceId)) {
        ProviderUtilities::setKeyProperty(path, instanceIdKey, instanceId);
    }
    return path;
}

template <class Policy>
CMPIInstance* RecordAdapter<Policy>::getCMPIInstance(const char** properties) {
    const Traced traced(at(Policy::unit), label::properties, properties);
    CMPIInstance* instance = ProviderUtilities::createInstance(broker, getObjectPath());
    if (instance != nullptr) {
        fillInstance(Policy::properties, element, broker, instance);
    }
    return instance;
}

template <class Policy>
CMPIInstance* RecordAdapter<Policy>::createCMPIInstance(const CMPIObjectPath* desiredObjectPath) {
    const Traced traced(at(Policy::unit), label::desiredObjectPath, desiredObjectPath);
    std::string instanceId;
    const bool found = ProviderUtilities::getKeyProperty(desiredObjectPath, instanceIdKey, instanceId);
    traceVariable(at(Policy::unit), "instanceId", instanceId);

    // Asked for at each creation, although nothing in the record depends on it.
    Instrumentation instrumentation;
    instrumentation.convertPathToString(instrumentation.getPathToComputer());

    if (!found || !element.create(instanceId)) {
        return nullptr;
    }
    if constexpr (Policy::tracesCreation) {
        traceVariable(at(Policy::unit), "Instance Created", 1U);
    }
    setObjectPath(desiredObjectPath);
    return getCMPIInstance(nullptr);
}

template <class Policy>
void RecordAdapter<Policy>::modifyCMPIInstance(const CMPIInstance* referenceInstance, const char** properties) {
    const Traced traced(at(Policy::unit), Policy::modifyPropertiesLabel, properties, label::referenceInstance,
                        referenceInstance);
    if (referenceInstance == nullptr) {
        return;
    }
    for (const auto& row : Policy::properties) {
        if (row.modify != nullptr) {
            row.modify(element, referenceInstance, row.name);
        }
    }
}

template <class Policy>
void RecordAdapter<Policy>::deleteCMPIInstance() {
    CMPIInstance* instance = nullptr;
    const Traced traced(at(Policy::unit), label::instance, instance);
    instance = getCMPIInstance(nullptr);
    element.remove();
}

}  // namespace KO::LeaseWarrantyProvider
