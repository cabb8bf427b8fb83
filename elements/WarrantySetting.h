#pragma once

#include "SettingElement.h"
#include "Warranty.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of warranties for SettingElement. */
struct WarrantySettingElementTraits {
    using Element = Warranty;
    static constexpr const char* constructor = "WarrantySetting";
    static constexpr const char* destructor = "~WarrantySetting";
    static constexpr const char* toElement = "getWarrantyMoniker";
    static constexpr bool toElementExits = true;
    static constexpr const char* elementLabel = " monikerWarranty=";

    static const TraceSource traceSource;
};

/** The managed element of VELKO_WarrantySetting: translates between monikers of computers and warranties. */
class WarrantySetting : public SettingElement<WarrantySettingElementTraits> {
public:
    Moniker getWarrantyMoniker(Moniker& computerMoniker) { return getElementMoniker(computerMoniker); }
};

extern template class SettingElement<WarrantySettingElementTraits>;

}  // namespace KO::LeaseWarrantyProvider
