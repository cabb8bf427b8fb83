#pragma once

#include <array>

#include "OstrelAgent.h"
#include "ProductAdapter.h"
#include "PropertyTable.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of VELKO_OstrelAgent for ProductAdapter. */
struct AgentAdapterTraits {
    using Element = OstrelAgent;
    static constexpr const char* className = "VELKO_OstrelAgent";
    static constexpr const char* constructor = "CMPIOstrelAgent";
    static constexpr const char* destructor = "~CMPIOstrelAgent";

    static const TraceSource traceSource;
    static const std::array<KeyRow<OstrelAgent>, 5> keys;
    static const std::array<KeyFilter<OstrelAgent>, 5> filters;
    static const std::array<PropertyRow<OstrelAgent>, 9> properties;
};

/** Adapter of VELKO_OstrelAgent, which is read-only. */
using CMPIOstrelAgent = ProductAdapter<AgentAdapterTraits>;

extern template class ElementAdapter<CMPIOstrelAgent, AgentAdapterTraits>;
extern template class ProductAdapter<AgentAdapterTraits>;

}  // namespace KO::LeaseWarrantyProvider
