#pragma once

#include "AssetIDDetails.h"
#include "ProductAdapter.h"
#include "PropertyTable.h"
#include "Trace.h"

#include <array>

namespace KO::LeaseWarrantyProvider {

/** The CIM class VELKO_AssetIDDetails: what the design shared with VELKO_OstrelAgent needs to know of it. */
struct AssetAdapterTraits {
    using Element = AssetIDDetails;
    static constexpr const char* className = "VELKO_AssetIDDetails";
    static constexpr const char* constructor = "CMPIAssetIDDetail";
    static constexpr const char* destructor = "~CMPIAssetIDDetail";

    static const TraceSource traceSource;
    static const std::array<KeyRow<AssetIDDetails>, 4> keys;
    static const std::array<KeyFilter<AssetIDDetails>, 4> filters;
    static const std::array<PropertyRow<AssetIDDetails>, 24> properties;

    /**
     * Takes the modifiable properties that the instance has, and writes the asset file, whatever was read of
     * it and whether or not the path's keys select a computer.
     */
    static void modify(AssetIDDetails& details, const CMPIInstance* instance);
};

/** The adapter of VELKO_AssetIDDetails. */
using CMPIAssetIDDetail = ProductAdapter<AssetAdapterTraits>;

extern template class ElementAdapter<AssetAdapterTraits>;
extern template class ProductAdapter<AssetAdapterTraits>;
extern template void CMPIAssetIDDetail::modifyCMPIInstance<AssetAdapterTraits>(const CMPIInstance*, const char**);

}  // namespace KO::LeaseWarrantyProvider
