#pragma once

#include <string>

#include "RecordElement.h"
#include "WarrantyBase.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of warranties for RecordElement. */
struct WarrantyElementTraits {
    using Base = WarrantyBase;

    static const TraceSource traceSource;
    static const RecordElementNames names;
};

/**
 * The managed element of VELKO_Warranty: a cursor over the warranties of this computer.
 *
 * The getters of the current warranty return true. Getters and setters throw InstrumentationException if there is no
 * current warranty.
 */
class Warranty : public RecordElement<WarrantyElementTraits> {
public:
    bool createWarranty(std::string instanceId) { return create(instanceId); }
    void removeWarranty() { remove(); }

    bool getWarrantor(std::string& value) const;
    bool getCommencementDate(std::string& value) const;  ///< CIM datetime string
    bool getDuration(unsigned int& value) const;

    void setWarrantor(std::string value);
    void setCommencementDate(std::string value);
    void setDuration(unsigned int value);
};

}  // namespace KO::LeaseWarrantyProvider
