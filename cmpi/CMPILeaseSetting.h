#pragma once

#include "CMPILease.h"
#include "KO/ClassIds.h"
#include "LeaseSetting.h"
#include "SettingAdapter.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of VELKO_LeaseSetting for SettingAdapter. */
struct LeaseSettingAdapterTraits {
    using Element = CMPILease;
    using Setting = LeaseSetting;
    static constexpr const char* associationClass = "VELKO_LeaseSetting";
    static constexpr const char* elementClass = "VELKO_Lease";
    static constexpr unsigned int associationClassId = ClassId::leaseSetting;
    static constexpr unsigned int elementClassId = ClassId::lease;
    static constexpr const char* constructor = "CMPILeaseSetting";
    static constexpr const char* destructor = "~CMPILeaseSetting";
    static constexpr const char* locate = "locateLease";

    static const TraceSource traceSource;
    static Moniker elementMoniker(LeaseSetting& setting, Moniker& moniker) { return setting.getLeaseMoniker(moniker); }
};

extern template class SettingAdapter<LeaseSettingAdapterTraits>;

/** Adapter of VELKO_LeaseSetting. */
class CMPILeaseSetting : public SettingAdapter<LeaseSettingAdapterTraits> {
public:
    using SettingAdapter::SettingAdapter;

    /** See locateElement(). */
    CMPIObjectPath* locateLease(const CMPIObjectPath* computerPath) { return locateElement(computerPath); }
};

}  // namespace KO::LeaseWarrantyProvider
