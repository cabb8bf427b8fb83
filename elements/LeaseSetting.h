#pragma once

#include "KO/Instrumentation.h"
#include "KO/Moniker.h"
#include "Lease.h"

namespace KO::LeaseWarrantyProvider {

/**
 * The managed element of VELKO_LeaseSetting: tells which lease belongs to a computer, and back. The
 * lease of a computer has the text form of the computer's node path as its identifier.
 *
 * Monikers carry one key: a computer's "Name", a lease's "InstanceID"; others are ignored, and of the
 * argument only the selection changes. The operations throw InstrumentationException and
 * FrameworkException; any other exception in them ends the process.
 */
class LeaseSetting {
public:
    LeaseSetting();
    ~LeaseSetting() noexcept(false);
    LeaseSetting(const LeaseSetting&) = delete;
    LeaseSetting& operator=(const LeaseSetting&) = delete;

    /**
     * The moniker of a computer's lease, of which the own lease element is made to stand on it. A
     * name that no computer bears gives the text of no node.
     */
    Moniker getLeaseMoniker(Moniker& computerMoniker);

    /** The moniker of the computer to which a lease belongs. */
    Moniker getComputerMoniker(Moniker& leaseMoniker);

private:
    Instrumentation instrumentation{};
    Lease element{};
};

}  // namespace KO::LeaseWarrantyProvider
