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
 * The moniker of a computer has the key "Name", that of a record the key "InstanceID", each spelled so;
 * other keys are ignored, and of the argument only the selection changes. The operations throw
 * FrameworkException for a moniker without its key and InstrumentationException for a node that has no
 * name, or is not there where a record tells its place. Of what arises below them they let these two
 * classes out; any other exception ends the process.
 *
 * Traits gives:
 *   Element                          the element of the records
 *   traceSource                      trace source
 *   constructor, destructor          their names in the log
 *   toElement, toElementExits        name in the log of the way to the record, and whether its exit is traced
 *   elementLabel                     label of the record's moniker
 */
template <class Traits>
class SettingElement {
public:
    SettingElement();
    ~SettingElement() noexcept(false);
    SettingElement(const SettingElement&) = delete;
    SettingElement& operator=(const SettingElement&) = delete;

    /** The moniker of the computer to which a record belongs, whether or not there is such a record. */
    Moniker getComputerMoniker(Moniker& elementMoniker);

protected:
    /**
     * The moniker of a computer's record, whether or not there is one. The setting's own element then
     * stands on that record, or at the end. For a name that no computer bears it is the text of no node.
     */
    Moniker getElementMoniker(Moniker& computerMoniker);

private:
    Moniker toElement(const CallSite& site, Moniker& computerMoniker);
    Moniker toComputer(const CallSite& site, Moniker& elementMoniker);

    Instrumentation instrumentation{};
    typename Traits::Element element{};
};

}  // namespace KO::LeaseWarrantyProvider
