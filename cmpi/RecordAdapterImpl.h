#pragma once

// Definitions of RecordAdapter. Included only by the source file of each adapter, so that its code and trace buffers
// belong to that translation unit.

#include <cmpift.h>

#include <optional>
#include <string>

#include "ElementAdapterImpl.h"
#include "KO/Instrumentation.h"
#include "KO/ProviderUtilities.h"
#include "PropertyTable.h"
#include "RecordAdapter.h"
#include "Trace.h"
#include "cim/CmpiAccess.h"

namespace KO::LeaseWarrantyProvider {

namespace {

constexpr const char* instanceIdKey = "InstanceID";

/** Returns the characters of a path's string key; none if the key has another type or cannot be read. */
std::optional<std::string> stringKey(const CMPIObjectPath* path, const char* name) {
    const auto key = cim::ask<&CMPIObjectPathFT::getKey>(path, name);
    if (!key.isOk() || !cim::hasValue(key.value) || key.value.type != CMPI_string) {
        return std::nullopt;
    }
    const auto characters = cim::ask<&CMPIStringFT::getCharPtr>(key.value.value.string);
    return characters.isOk() && characters.value != nullptr ? std::optional<std::string>(characters.value)
                                                            : std::nullopt;
}

}  // namespace

template <class Traits>
void RecordAdapter<Traits>::narrow(typename Traits::Element& element, const CMPIObjectPath* path) {
    const Traced traced(at(Traits::traceSource, Level::flow, "setObjectPath"), label::objectPath, path);
    if (ProviderUtilities::getKeyCount(path) == 0) {
        return;
    }
    if (const auto instanceId = stringKey(path, instanceIdKey)) {
        element.setFilter(Traits::Element::InstanceIDFilter, *instanceId);
    }
}

template <class Traits>
CMPIObjectPath* RecordAdapter<Traits>::getObjectPath() {
    const Traced traced(at(Traits::traceSource));
    CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, Traits::className, nameSpace);
    std::string instanceId;
    if (path != nullptr && element && element.getInstanceID(instanceId)) {
        ProviderUtilities::setKeyProperty(path, instanceIdKey, instanceId);
    }
    return path;
}

template <class Traits>
CMPIInstance* RecordAdapter<Traits>::createCMPIInstance(const CMPIObjectPath* desiredObjectPath) {
    const Traced traced(at(Traits::traceSource), label::desiredObjectPath, desiredObjectPath);
    std::string instanceId;
    const bool found = ProviderUtilities::getKeyProperty(desiredObjectPath, instanceIdKey, instanceId);
    traceVariable(at(Traits::traceSource), "instanceId", instanceId);

    // The path is requested for each creation, although the record does not depend on it.
    Instrumentation instrumentation;
    instrumentation.convertPathToString(instrumentation.getPathToComputer());

    if (!found || !element.create(instanceId)) {
        return nullptr;
    }
    if constexpr (Traits::tracesCreation) {
        traceVariable(at(Traits::traceSource), "Instance Created", 1U);
    }
    narrow(element, desiredObjectPath);
    return this->getCMPIInstance(nullptr);
}

template <class Traits>
void RecordAdapter<Traits>::modifyCMPIInstance(const CMPIInstance* referenceInstance, const char** properties) {
    const Traced traced(at(Traits::traceSource), Traits::modifyPropertiesLabel, properties, label::referenceInstance,
                        referenceInstance);
    if (referenceInstance == nullptr) {
        return;
    }
    for (const auto& row : Traits::properties) {
        if (row.modify != nullptr) {
            row.modify(element, referenceInstance, row.name);
        }
    }
}

template <class Traits>
void RecordAdapter<Traits>::deleteCMPIInstance() {
    CMPIInstance* instance = nullptr;
    const Traced traced(at(Traits::traceSource), label::instance, instance);
    instance = this->getCMPIInstance(nullptr);
    element.remove();
}

}  // namespace KO::LeaseWarrantyProvider
