#pragma once

#include <string>

#include "LeaseBase.h"
#include "RecordElement.h"

namespace KO::LeaseWarrantyProvider {

/** Traits of leases for RecordElement. */
struct LeaseElementTraits {
    using Base = LeaseBase;

    static const TraceSource traceSource;
    static const RecordElementNames names;
};

/**
 * The managed element of VELKO_Lease: a cursor over the leases of this computer.
 *
 * The getters of the current lease return true. Getters and setters throw InstrumentationException if there is no
 * current lease.
 */
class Lease : public RecordElement<LeaseElementTraits> {
public:
    bool createLease(std::string instanceId) { return create(instanceId); }
    void removeLease() { remove(); }

    bool getLessor(std::string& value) const;
    bool getBaseTermCommencementDate(std::string& value) const;  ///< CIM datetime string
    bool getBaseRent(std::string& value) const;                  ///< amount of money, unparsed, like the next three
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
