#pragma once

#include "LeaseBase.h"
#include "RecordElement.h"

#include <string>

namespace KO::LeaseWarrantyProvider {

/** What the design shared with the warranty element needs to know of leases. */
struct LeaseElement {
    using Base = LeaseBase;
    using Property = Properties::Lease;
    static constexpr Property identifier = Property::InstanceID;

    static const TraceUnit& unit();
    static const RecordElementTexts& texts();
};

/**
 * The managed element of VELKO_Lease: the leases of this computer, one after the other. One is made
 * for a request; what it changes is seen by all at once, and Lease.dat is rewritten when it ends.
 *
 * The getters of the current lease answer true. They and the setters throw InstrumentationException
 * when no lease is current.
 */
class Lease : public RecordElement<LeaseElement> {
public:
    /** Stands on the first lease. May throw InstrumentationException, as LeaseBase does. */
    Lease();

    /** Rewrites the file if this element changed anything; that may throw. */
    ~Lease() noexcept(false);

    /** Makes a lease. @return true. Throws InstrumentationException when the identifier is taken. */
    bool createLease(std::string instanceId);

    /** Removes the current lease. Throws InstrumentationException when no filter was set or none is current. */
    void removeLease();

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
