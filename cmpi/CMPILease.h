#pragma once

#include <array>

#include "Lease.h"
#include "PropertyTable.h"
#include "RecordAdapter.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of VELKO_Lease for RecordAdapter. */
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

/** Adapter of VELKO_Lease. */
using CMPILease = RecordAdapter<LeaseAdapterTraits>;

extern template class ElementAdapter<CMPILease, LeaseAdapterTraits>;
extern template class RecordAdapter<LeaseAdapterTraits>;

}  // namespace KO::LeaseWarrantyProvider
