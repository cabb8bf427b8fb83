#pragma once

#include "KO/Instrumentation.h"
#include "KO/Moniker.h"
#include "Warranty.h"

namespace KO::LeaseWarrantyProvider {

/**
 * The managed element of VELKO_WarrantySetting: tells which warranty belongs to a computer, and back. The
 * warranty of a computer has the text form of the computer's node path as its identifier.
 *
 * Monikers carry one key: a computer's "Name", a warranty's "InstanceID"; others are ignored, and of the
 * argument only the selection changes. The operations throw InstrumentationException and
 * FrameworkException; any other exception in them ends the process.
 */
class WarrantySetting {
public:
    WarrantySetting();
    ~WarrantySetting() noexcept(false);
    WarrantySetting(const WarrantySetting&) = delete;
    WarrantySetting& operator=(const WarrantySetting&) = delete;

    /**
     * The moniker of a computer's warranty, of which the own warranty element is made to stand on it. A
     * name that no computer bears gives the text of no node.
     */
    Moniker getWarrantyMoniker(Moniker& computerMoniker);

    /** The moniker of the computer to which a warranty belongs. */
    Moniker getComputerMoniker(Moniker& warrantyMoniker);

private:
    Instrumentation instrumentation{};
    Warranty element{};
};

}  // namespace KO::LeaseWarrantyProvider
