#pragma once

#include "Lease.h"
#include "SettingElement.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of leases for SettingElement. */
struct LeaseSettingElementTraits {
    using Element = Lease;
    static constexpr const char* constructor = "LeaseSetting";
    static constexpr const char* destructor = "~LeaseSetting";
    static constexpr const char* toElement = "getLeaseMoniker";
    static constexpr bool toElementExits = false;  // unlike for every other operation, the exit is not traced
    static constexpr const char* elementLabel = " monikerLease=";

    static const TraceSource traceSource;
};

/** The managed element of VELKO_LeaseSetting: translates between monikers of computers and leases. */
class LeaseSetting : public SettingElement<LeaseSettingElementTraits> {
public:
    Moniker getLeaseMoniker(Moniker& computerMoniker) { return getElementMoniker(computerMoniker); }
};

extern template class SettingElement<LeaseSettingElementTraits>;

}  // namespace KO::LeaseWarrantyProvider
