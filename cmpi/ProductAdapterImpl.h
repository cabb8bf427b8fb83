#pragma once

// Definitions of ProductAdapter. Included only by the source file of each adapter, so that its code and trace buffers
// belong to that translation unit.

#include <string>

#include "ElementAdapterImpl.h"
#include "KO/ProviderUtilities.h"
#include "ProductAdapter.h"
#include "PropertyTable.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

namespace {
constexpr const char* keyValueName = "l_keyValue";
}  // namespace

template <class Traits>
void ProductAdapter<Traits>::narrow(typename Traits::Element& element, const CMPIObjectPath* path) {
    const Traced traced(at(Traits::traceSource, Level::flow, "setObjectPath"));
    if (ProviderUtilities::getKeyCount(path) == 0) {
        return;
    }
    for (const auto& filter : Traits::filters) {
        std::string value;
        if (ProviderUtilities::getKeyProperty(path, filter.name, value)) {
            traceVariable(at(Traits::traceSource, Level::flow, "setObjectPath"), keyValueName, value);
            element.setFilter(filter.type, value);
        }
    }
}

template <class Traits>
CMPIObjectPath* ProductAdapter<Traits>::getObjectPath() {
    const Traced traced(at(Traits::traceSource));
    CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, Traits::className, nameSpace);
    if (path == nullptr) {
        return nullptr;
    }
    std::string value;
    for (const auto& key : Traits::keys) {
        key.read(element, value);
        traceVariable(at(Traits::traceSource), keyValueName, value);
        ProviderUtilities::setKeyProperty(path, key.name, value);
    }
    return path;
}

template <class Traits>
template <class ModifiablePolicy>
void ProductAdapter<Traits>::modifyCMPIInstance(const CMPIInstance* referenceInstance, const char** properties) {
    // Explicit, since __builtin_FUNCTION of a function template includes the template argument.
    const Traced traced(at(Traits::traceSource, Level::flow, "modifyCMPIInstance"), label::referenceInstance,
                        referenceInstance, label::propertiesBare, properties);
    if (referenceInstance != nullptr) {
        ModifiablePolicy::modify(element, referenceInstance);
    }
}

}  // namespace KO::LeaseWarrantyProvider
