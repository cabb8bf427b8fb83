#pragma once

#include "LeaseUnit.h"
#include "RecordBase.h"
#include "RecordFields.h"

#include <array>
#include <string>

namespace KO::LeaseWarrantyProvider {

namespace Properties {

/** The properties of a lease record. The numbers are fixed, since they appear in the log. */
enum class Lease : int {
    InstanceID = 0,
    LeaseTerm = 1,
    NetMonthlyLeaseRateFactor = 2,
    Lessor = 3,
    BaseTermCommencementDate = 4,
    BaseRent = 5,
    FairMarketRental = 6,
    FairMarketValue = 7,
    TerminationValue = 8,
    EarlyTerminationOption = 9,
    FixedPricePurchaseOption = 10,
    RenewalOption = 11,
    BargainRenewalOption = 12,
};

}  // namespace Properties

/** The number of leases in use, which is the first line of the file. */
struct LeaseCount {
    unsigned int recordCountLease = 0;

    unsigned int& count() { return recordCountLease; }
};

/** Traits of leases for RecordCache and RecordBase. */
struct LeaseStoreTraits {
    using Unit = LeaseUnit;
    using Count = LeaseCount;
    using Property = Properties::Lease;

    static const TraceSource traceSource;
    static const RecordStoreNames names;
    /** In file order. */
    static constexpr std::array<RecordField<Unit, Property>, 13> fields{{
        {Property::InstanceID, &LeaseUnit::InstanceID, TextForm::identifier},
        {Property::Lessor, &LeaseUnit::Lessor},
        {Property::BaseTermCommencementDate, &LeaseUnit::BaseTermCommencementDate, TextForm::date},
        {Property::LeaseTerm, &LeaseUnit::LeaseTerm},
        {Property::EarlyTerminationOption, &LeaseUnit::EarlyTerminationOption},
        {Property::FixedPricePurchaseOption, &LeaseUnit::FixedPricePurchaseOption},
        {Property::RenewalOption, &LeaseUnit::RenewalOption},
        {Property::BargainRenewalOption, &LeaseUnit::BargainRenewalOption},
        {Property::BaseRent, &LeaseUnit::BaseRent},
        {Property::FairMarketRental, &LeaseUnit::FairMarketRental},
        {Property::FairMarketValue, &LeaseUnit::FairMarketValue},
        {Property::TerminationValue, &LeaseUnit::TerminationValue},
        {Property::NetMonthlyLeaseRateFactor, &LeaseUnit::NetMonthlyLeaseRateFactor},
    }};
    static RecordCache<LeaseStoreTraits>& cache();
};

/** The process-wide lease table, stored in Lease.dat. */
using LeaseCache = RecordCache<LeaseStoreTraits>;

/** A cursor over the lease records that can create and delete records. */
class LeaseBase : public RecordBase<LeaseStoreTraits> {
public:
    void selectLease(const std::string& instanceId) { select(instanceId); }
    bool createLease(const std::string& instanceId) { return create(instanceId); }
    void deleteLease() { remove(); }

    using RecordBase::getProperty;
    using RecordBase::setProperty;
    bool getProperty(Properties::Lease property, bool& value) const;
    void setProperty(Properties::Lease property, bool value);

    static LeaseCache cache;
};

}  // namespace KO::LeaseWarrantyProvider
