#pragma once

// Definitions of ElementAdapter. Include only in RecordAdapterImpl.h and ProductAdapterImpl.h.

#include <utility>

#include "ElementAdapter.h"
#include "KO/ProviderUtilities.h"
#include "PropertyTable.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

template <class Adapter, class Traits>
ElementAdapter<Adapter, Traits>::ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                                std::string requestNameSpace)
    : broker(requestBroker), context(requestContext), nameSpace(std::move(requestNameSpace)) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::constructor), label::broker, broker,
                        label::context, context);
}

template <class Adapter, class Traits>
ElementAdapter<Adapter, Traits>::ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                                const CMPIObjectPath* path)
    : broker(requestBroker), context(requestContext), nameSpace(ProviderUtilities::getNamespace(path)) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::constructor), label::broker, broker,
                        label::context, context, label::objectPath, path);
    Adapter::narrow(element, path);
}

template <class Adapter, class Traits>
ElementAdapter<Adapter, Traits>::~ElementAdapter() noexcept(false) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::destructor));
}

template <class Adapter, class Traits>
ElementAdapter<Adapter, Traits>::operator bool() {
    const Traced traced(at(Traits::traceSource));
    return element;
}

template <class Adapter, class Traits>
void ElementAdapter<Adapter, Traits>::operator++() {
    const Traced traced(at(Traits::traceSource));
    ++element;
}

template <class Adapter, class Traits>
void ElementAdapter<Adapter, Traits>::setObjectPath(const CMPIObjectPath* path) {
    Adapter::narrow(element, path);
}

template <class Adapter, class Traits>
CMPIInstance* ElementAdapter<Adapter, Traits>::getCMPIInstance(const char** properties) {
    const Traced traced(at(Traits::traceSource), label::properties, properties);
    CMPIObjectPath* path = static_cast<Adapter*>(this)->getObjectPath();
    CMPIInstance* instance = ProviderUtilities::createInstance(broker, path);
    if (instance != nullptr) {
        fillInstance(Traits::properties, element, broker, instance);
    }
    return instance;
}

}  // namespace KO::LeaseWarrantyProvider
