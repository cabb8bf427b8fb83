#pragma once

#include "CMPIWarranty.h"
#include "KO/ClassIds.h"
#include "SettingAdapter.h"
#include "WarrantySetting.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of VELKO_WarrantySetting for SettingAdapter. */
struct WarrantySettingAdapterTraits {
    using Element = CMPIWarranty;
    using Setting = WarrantySetting;
    static constexpr const char* associationClass = "VELKO_WarrantySetting";
    static constexpr const char* elementClass = "VELKO_Warranty";
    static constexpr unsigned int associationClassId = ClassId::warrantySetting;
    static constexpr unsigned int elementClassId = ClassId::warranty;
    static constexpr const char* constructor = "CMPIWarrantySetting";
    static constexpr const char* destructor = "~CMPIWarrantySetting";
    static constexpr const char* locate = "locateWarranty";

    static const TraceSource traceSource;
    static Moniker elementMoniker(WarrantySetting& setting, Moniker& moniker) {
        return setting.getWarrantyMoniker(moniker);
    }
};

extern template class SettingAdapter<WarrantySettingAdapterTraits>;

/** Adapter of VELKO_WarrantySetting. */
class CMPIWarrantySetting : public SettingAdapter<WarrantySettingAdapterTraits> {
public:
    using SettingAdapter::SettingAdapter;

    /** See locateElement(). */
    CMPIObjectPath* locateWarranty(const CMPIObjectPath* computerPath) { return locateElement(computerPath); }
};

}  // namespace KO::LeaseWarrantyProvider
