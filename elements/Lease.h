#pragma once

#include "LeaseBase.h"
#include "RecordElement.h"

#include <string>

namespace KO::LeaseWarrantyProvider {

/** What the design shared with the warranty element needs to know of leases. */
struct LeaseElementTraits {
    using Base = LeaseBase;

    static const TraceSource traceSource;
    static const RecordElementNames names;
};

/**
 * The managed element of VELKO_Lease: the leases of this computer, one after the other.
 *
 * The getters of the current lease answer true. They and the setters throw InstrumentationException
 * when no lease is current.
 */
class Lease : public RecordElement<LeaseElementTraits> {
public:
    bool createLease(std::string instanceId) { return create(instanceId); }
    void removeLease() { remove(); }

    bool getLessor(std::string& value) const;
    bool getBaseTermCommencementDate(std::string& value) const;  ///< CIM datetime text
    bool getBaseRent(std::string& value) const;                  ///< money as the client wrote it, like the next three
    bool getFairMarketRental(std::string& value) const;
    bool getFairMarketValue(std::string& value) const;
    bool getTerminationValue(std::string& value) const;
    bool getLeaseTerm(unsigned int& value) const;
    bool getNetMonthlyLeaseRateFactor(unsigned int& value) const;
    bool getEarlyTerminationOption(bool& value) const;
    bool getFixedPricePurchaseOption(bool& value) const;
    bool getRenewalOption(bool& value) const;
    bool getBargainRenewalOption(bool& value) const;

    void setLessor(std::string value);
    void setBaseTermCommencementDate(std::string value);
    void setBaseRent(std::string value);
    void setFairMarketRental(std::string value);
    void setFairMarketValue(std::string value);
    void setTerminationValue(std::string value);
    void setLeaseTerm(unsigned int value);
    void setNetMonthlyLeaseRateFactor(unsigned int value);
    void setEarlyTerminationOption(bool value);
    void setFixedPricePurchaseOption(bool value);
    void setRenewalOption(bool value);
    void setBargainRenewalOption(bool value);
};

}  // namespace KO::LeaseWarrantyProvider
