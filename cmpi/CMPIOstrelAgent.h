#pragma once

#include "OstrelAgent.h"
#include "ProductAdapter.h"
#include "PropertyTable.h"
#include "Trace.h"

#include <array>

namespace KO::LeaseWarrantyProvider {

/** The CIM class VELKO_OstrelAgent: what the design shared with VELKO_AssetIDDetails needs to know of it. */
struct AgentClass {
    using Element = OstrelAgent;
    static constexpr const char* className = "VELKO_OstrelAgent";
    static constexpr const char* constructor = "CMPIOstrelAgent";
    static constexpr const char* destructor = "~CMPIOstrelAgent";

    static const TraceUnit unit;
    static const std::array<KeyRow<OstrelAgent>, 5> keys;
    static const std::array<KeyFilter<OstrelAgent>, 5> filters;
    static const std::array<PropertyRow<OstrelAgent>, 9> properties;
};

/** The adapter of VELKO_OstrelAgent, which is only read. */
using CMPIOstrelAgent = ProductAdapter<AgentClass>;

extern template class ElementAdapter<AgentClass>;
extern template class ProductAdapter<AgentClass>;

}  // namespace KO::LeaseWarrantyProvider
