#pragma once

#include "KO/Instrumentation.h"
#include "KO/Moniker.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

/**
 * The managed element of a setting association: tells which lease or warranty belongs to a computer,
 * and back. A record belongs to the computer whose node path, in text form, is the record's identifier.
 * The design that LeaseSetting and WarrantySetting share.
 *
 * Monikers carry one key: a computer's "Name", a record's "InstanceID"; others are ignored, and of the
 * argument only the selection changes. The operations throw InstrumentationException and
 * FrameworkException; any other exception in them ends the process.
 *
 * Policy gives:
 *   Element                          the element of the records
 *   unit                             trace unit
 *   constructor, destructor          their names in the log
 *   toElement, toElementExits        name in the log of the way to the record, and whether its exit is traced
 *   elementLabel                     label of the record's moniker
 */
template <class Policy>
class SettingElement {
public:
    SettingElement();
    ~SettingElement() noexcept(false);
    SettingElement(const SettingElement&) = delete;
    SettingElement& operator=(const SettingElement&) = delete;

    /** The moniker of the computer to which a record belongs. */
    Moniker getComputerMoniker(Moniker& elementMoniker);

protected:
    /**
     * The moniker of a computer's record. The setting's own element then stands on that record, if there
     * is one. A name that no computer bears gives the text of no node.
     */
    Moniker getElementMoniker(Moniker& computerMoniker);

private:
    Moniker toElement(const CallSite& site, Moniker& computerMoniker);
    Moniker toComputer(const CallSite& site, Moniker& elementMoniker);

    Instrumentation instrumentation{};
    typename Policy::Element element{};
};

}  // namespace KO::LeaseWarrantyProvider
