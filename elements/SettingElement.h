#pragma once

#include "KO/Instrumentation.h"
#include "KO/Moniker.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

/**
 * The managed element of a setting association: translates the moniker of a computer to that of its lease or warranty,
 * and back. A record belongs to a computer if its identifier is the string form of the computer's node path. Base of
 * LeaseSetting and WarrantySetting.
 *
 * A computer's moniker has the key "Name", and a record's moniker has the key "InstanceID". Key names are
 * case-sensitive, and other keys are ignored. The operations change only the selected key of their argument. They throw
 * FrameworkException if the key is missing or the process is out of memory, and InstrumentationException if the node
 * has no name or a record's identifier is not the path of a node. Any other exception terminates the process.
 *
 * Traits defines:
 *   Element                          the element of the records
 *   traceSource                      trace source
 *   constructor, destructor          names of the constructor and the destructor in the log
 *   toElement, toElementExits        name of getElementMoniker() in the log, and whether its exit is traced
 *   elementLabel                     label of the record's moniker
 */
template <class Traits>
class SettingElement {
public:
    SettingElement();
    ~SettingElement() noexcept(false);
    SettingElement(const SettingElement&) = delete;
    SettingElement& operator=(const SettingElement&) = delete;

    /** Returns the moniker of a record's computer, whether or not the record exists. */
    Moniker getComputerMoniker(Moniker& elementMoniker);

protected:
    /**
     * Returns the moniker of a computer's record, whether or not the record exists. Moves the setting's element to that
     * record, or to the end. If no computer has the name, the moniker contains the string form of the empty path.
     */
    Moniker getElementMoniker(Moniker& computerMoniker);

private:
    Moniker toElement(const CallSite& site, Moniker& computerMoniker);
    Moniker toComputer(const CallSite& site, Moniker& elementMoniker);

    Instrumentation instrumentation{};
    typename Traits::Element element{};
};

}  // namespace KO::LeaseWarrantyProvider
