#pragma once

#include "SettingElement.h"
#include "Warranty.h"

namespace KO::LeaseWarrantyProvider {

/** What the design shared by the setting elements needs to know of warrantys. */
struct WarrantySettingElement {
    using Element = Warranty;
    static constexpr const char* constructor = "WarrantySetting";
    static constexpr const char* destructor = "~WarrantySetting";
    static constexpr const char* toElement = "getWarrantyMoniker";
    static constexpr bool toElementExits = true;
    static constexpr const char* elementLabel = " monikerWarranty=";

    static const TraceUnit unit;
};

/** The managed element of VELKO_WarrantySetting: which warranty belongs to a computer, and which computer to a
 * warranty. */
class WarrantySetting : public SettingElement<WarrantySettingElement> {
public:
    Moniker getWarrantyMoniker(Moniker& computerMoniker) { return getElementMoniker(computerMoniker); }
};

extern template class SettingElement<WarrantySettingElement>;

}  // namespace KO::LeaseWarrantyProvider
