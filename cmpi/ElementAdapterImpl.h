#pragma once

// Definitions of ElementAdapter. Include only in RecordAdapterImpl.h and ProductAdapterImpl.h.

#include "ElementAdapter.h"
#include "KO/ProviderUtilities.h"
#include "Trace.h"

#include <utility>

namespace KO::LeaseWarrantyProvider {

template <class Traits>
ElementAdapter<Traits>::ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                       std::string requestNameSpace)
    : broker(requestBroker), context(requestContext), nameSpace(std::move(requestNameSpace)) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::constructor), label::broker, broker,
                        label::context, context);
}

template <class Traits>
ElementAdapter<Traits>::ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                       const CMPIObjectPath* path,
                                       void (*narrow)(Element& element, const CMPIObjectPath* path))
    : broker(requestBroker), context(requestContext), nameSpace(ProviderUtilities::getNamespace(path)) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::constructor), label::broker, broker,
                        label::context, context, label::objectPath, path);
    narrow(element, path);
}

template <class Traits>
ElementAdapter<Traits>::~ElementAdapter() noexcept(false) {
    const Traced traced(at(Traits::traceSource, Level::flow, Traits::destructor));
}

template <class Traits>
ElementAdapter<Traits>::operator bool() {
    const Traced traced(at(Traits::traceSource));
    return element;
}

template <class Traits>
void ElementAdapter<Traits>::operator++() {
    const Traced traced(at(Traits::traceSource));
    ++element;
}

}  // namespace KO::LeaseWarrantyProvider
