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
 * current lease. The date is a CIM datetime string. Amounts of money are strings and are not parsed.
 */
class Lease : public RecordElement<LeaseElementTraits> {
public:
    bool createLease(std::string instanceId) { return create(instanceId); }
    void removeLease() { remove(); }

    bool getLessor(std::string& value) const { return get(Property::Lessor, value); }
    bool getBaseTermCommencementDate(std::string& value) const {
        return get(Property::BaseTermCommencementDate, value);
    }
    bool getBaseRent(std::string& value) const { return get(Property::BaseRent, value); }
    bool getFairMarketRental(std::string& value) const { return get(Property::FairMarketRental, value); }
    bool getFairMarketValue(std::string& value) const { return get(Property::FairMarketValue, value); }
    bool getTerminationValue(std::string& value) const { return get(Property::TerminationValue, value); }
    bool getLeaseTerm(unsigned int& value) const { return get(Property::LeaseTerm, value); }
    bool getNetMonthlyLeaseRateFactor(unsigned int& value) const {
        return get(Property::NetMonthlyLeaseRateFactor, value);
    }
    bool getEarlyTerminationOption(bool& value) const { return get(Property::EarlyTerminationOption, value); }
    bool getFixedPricePurchaseOption(bool& value) const { return get(Property::FixedPricePurchaseOption, value); }
    bool getRenewalOption(bool& value) const { return get(Property::RenewalOption, value); }
    bool getBargainRenewalOption(bool& value) const { return get(Property::BargainRenewalOption, value); }

    void setLessor(std::string value) { set(Property::Lessor, value); }
    void setBaseTermCommencementDate(std::string value) { set(Property::BaseTermCommencementDate, value); }
    void setBaseRent(std::string value) { set(Property::BaseRent, value); }
    void setFairMarketRental(std::string value) { set(Property::FairMarketRental, value); }
    void setFairMarketValue(std::string value) { set(Property::FairMarketValue, value); }
    void setTerminationValue(std::string value) { set(Property::TerminationValue, value); }
    void setLeaseTerm(unsigned int value) { set(Property::LeaseTerm, value); }
    void setNetMonthlyLeaseRateFactor(unsigned int value) { set(Property::NetMonthlyLeaseRateFactor, value); }
    void setEarlyTerminationOption(bool value) { set(Property::EarlyTerminationOption, value); }
    void setFixedPricePurchaseOption(bool value) { set(Property::FixedPricePurchaseOption, value); }
    void setRenewalOption(bool value) { set(Property::RenewalOption, value); }
    void setBargainRenewalOption(bool value) { set(Property::BargainRenewalOption, value); }
};

}  // namespace KO::LeaseWarrantyProvider
