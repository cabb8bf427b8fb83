#pragma once

#include <array>

#include "PropertyTable.h"
#include "RecordAdapter.h"
#include "Warranty.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of VELKO_Warranty for RecordAdapter. */
struct WarrantyAdapterTraits {
    using Element = Warranty;
    static constexpr const char* className = "VELKO_Warranty";
    static constexpr const char* constructor = "CMPIWarranty";
    static constexpr const char* destructor = "~CMPIWarranty";
    static constexpr bool tracesCreation = false;
    static constexpr const char* modifyPropertiesLabel = " properties=";

    static const TraceSource traceSource;
    static const std::array<PropertyRow<Warranty>, 9> properties;
};

/** Adapter of VELKO_Warranty. */
using CMPIWarranty = RecordAdapter<WarrantyAdapterTraits>;

extern template class ElementAdapter<CMPIWarranty, WarrantyAdapterTraits>;
extern template class RecordAdapter<WarrantyAdapterTraits>;

}  // namespace KO::LeaseWarrantyProvider
