#pragma once

// Definitions of ElementAdapter. Included by the definitions of the adapters that build on it, and
// nowhere else.

#include "ElementAdapter.h"
#include "KO/ProviderUtilities.h"
#include "Trace.h"

#include <utility>

namespace KO::LeaseWarrantyProvider {

template <class Policy>
ElementAdapter<Policy>::ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                       std::string requestNameSpace)
    : broker(requestBroker), context(requestContext), nameSpace(std::move(requestNameSpace)) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::constructor), label::broker, broker, label::context,
                        context);
}

template <class Policy>
ElementAdapter<Policy>::ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                       const CMPIObjectPath* path,
                                       void (*narrow)(Element& element, const CMPIObjectPath* path))
    : broker(requestBroker), context(requestContext), nameSpace(ProviderUtilities::getNamespace(path)) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::constructor), label::broker, broker, label::context,
                        context, label::objectPath, path);
    narrow(element, path);
}

template <class Policy>
ElementAdapter<Policy>::~ElementAdapter() noexcept(false) {
    const Traced traced(at(Policy::unit, Level::flow, Policy::destructor));
}

template <class Policy>
ElementAdapter<Policy>::operator bool() {
    const Traced traced(at(Policy::unit));
    return element;
}

template <class Policy>
void ElementAdapter<Policy>::operator++() {
    const Traced traced(at(Policy::unit));
    ++element;
}

}  // namespace KO::LeaseWarrantyProvider
