#pragma once

#include "Lease.h"
#include "PropertyTable.h"
#include "RecordAdapter.h"

#include <array>

namespace KO::LeaseWarrantyProvider {

/** The CIM class VELKO_Lease: what the design shared with VELKO_Warranty needs to know of it. */
struct LeaseAdapterTraits {
    using Element = Lease;
    static constexpr const char* className = "VELKO_Lease";
    static constexpr const char* constructor = "CMPILease";
    static constexpr const char* destructor = "~CMPILease";
    static constexpr bool tracesCreation = true;
    static constexpr const char* modifyPropertiesLabel = " properties";

    static const TraceSource traceSource;
    static const std::array<PropertyRow<Lease>, 18> properties;
};

/** The adapter of VELKO_Lease. */
using CMPILease = RecordAdapter<LeaseAdapterTraits>;

extern template class ElementAdapter<LeaseAdapterTraits>;
extern template class RecordAdapter<LeaseAdapterTraits>;

}  // namespace KO::LeaseWarrantyProvider
