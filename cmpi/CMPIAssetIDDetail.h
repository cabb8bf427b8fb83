#pragma once

#include <array>

#include "AssetIDDetails.h"
#include "ProductAdapter.h"
#include "PropertyTable.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of VELKO_AssetIDDetails for ProductAdapter. */
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
     * Sets the modifiable properties that the instance has and writes the asset file. Writes the file even if it could
     * not be read, or if the path's keys select no computer.
     */
    static void modify(AssetIDDetails& details, const CMPIInstance* instance);
};

/** Adapter of VELKO_AssetIDDetails. */
using CMPIAssetIDDetail = ProductAdapter<AssetAdapterTraits>;

extern template class ElementAdapter<CMPIAssetIDDetail, AssetAdapterTraits>;
extern template class ProductAdapter<AssetAdapterTraits>;
extern template void CMPIAssetIDDetail::modifyCMPIInstance<AssetAdapterTraits>(const CMPIInstance*, const char**);

}  // namespace KO::LeaseWarrantyProvider
