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
 * current warranty. The date is a CIM datetime string.
 */
class Warranty : public RecordElement<WarrantyElementTraits> {
public:
    bool createWarranty(std::string instanceId) { return create(instanceId); }
    void removeWarranty() { remove(); }

    bool getWarrantor(std::string& value) const { return get(Property::Warrantor, value); }
    bool getCommencementDate(std::string& value) const { return get(Property::CommencementDate, value); }
    bool getDuration(unsigned int& value) const { return get(Property::Duration, value); }

    void setWarrantor(std::string value) { set(Property::Warrantor, value); }
    void setCommencementDate(std::string value) { set(Property::CommencementDate, value); }
    void setDuration(unsigned int value) { set(Property::Duration, value); }
};

}  // namespace KO::LeaseWarrantyProvider
