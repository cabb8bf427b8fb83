#pragma once

#include "RecordElement.h"
#include "WarrantyBase.h"

#include <string>

namespace KO::LeaseWarrantyProvider {

/** What the design shared with the lease element needs to know of warranties. */
struct WarrantyElementTraits {
    using Base = WarrantyBase;

    static const TraceSource traceSource;
    static const RecordElementNames names;
};

/**
 * The managed element of VELKO_Warranty: the warranties of this computer, one after the other.
 *
 * The getters of the current warranty answer true. They and the setters throw InstrumentationException
 * when no warranty is current.
 */
class Warranty : public RecordElement<WarrantyElementTraits> {
public:
    bool createWarranty(std::string instanceId) { return create(instanceId); }
    void removeWarranty() { remove(); }

    bool getWarrantor(std::string& value) const;
    bool getCommencementDate(std::string& value) const;  ///< CIM datetime text
    bool getDuration(unsigned int& value) const;

    void setWarrantor(std::string value);
    void setCommencementDate(std::string value);
    void setDuration(unsigned int value);
};

}  // namespace KO::LeaseWarrantyProvider
