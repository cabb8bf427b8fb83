#pragma once

#include "Lease.h"
#include "SettingElement.h"

namespace KO::LeaseWarrantyProvider {

/** What the design that the setting elements share needs to know of leases. */
struct LeaseSettingElementTraits {
    using Element = Lease;
    static constexpr const char* constructor = "LeaseSetting";
    static constexpr const char* destructor = "~LeaseSetting";
    static constexpr const char* toElement = "getLeaseMoniker";
    static constexpr bool toElementExits = false;  // unlike every other operation
    static constexpr const char* elementLabel = " monikerLease=";

    static const TraceSource traceSource;
};

/** The managed element of VELKO_LeaseSetting: which lease a computer has, and which computer has a lease. */
class LeaseSetting : public SettingElement<LeaseSettingElementTraits> {
public:
    Moniker getLeaseMoniker(Moniker& computerMoniker) { return getElementMoniker(computerMoniker); }
};

extern template class SettingElement<LeaseSettingElementTraits>;

}  // namespace KO::LeaseWarrantyProvider
