#pragma once

#include <array>
#include <fstream>
#include <string>

#include "RecordBase.h"

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

struct LeaseStoreTraits;

/** The terms of one lease. Amounts of money are strings and are not parsed. */
struct LeaseUnit : private RecordTrace<LeaseStoreTraits> {
    LeaseUnit() = default;
    explicit LeaseUnit(const std::string& instanceId) : RecordTrace(instanceId), InstanceID(instanceId) {}

    bool inUse = true;  ///< false once deleted: the record stays in the table and is skipped
    bool EarlyTerminationOption = false;
    bool FixedPricePurchaseOption = false;
    bool RenewalOption = false;
    bool BargainRenewalOption = false;
    unsigned int LeaseTerm = 0;
    unsigned int NetMonthlyLeaseRateFactor = 0;
    std::string InstanceID;  ///< key, unique among the records in use
    std::string Lessor;
    std::string BaseRent;
    std::string BaseTermCommencementDate;  ///< CIM datetime string
    std::string FairMarketRental;
    std::string FairMarketValue;
    std::string TerminationValue;
};

/** Reads one record of a lease file from the stream's position. A field that cannot be read keeps its value. */
std::ifstream& operator>>(std::ifstream& source, LeaseUnit& lease);

/** Writes one record of a lease file: thirteen fields, one per line, each line flushed. */
std::ofstream& operator<<(std::ofstream& target, const LeaseUnit& lease);

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
};

template <>
LeaseCache RecordBase<LeaseStoreTraits>::cache;

}  // namespace KO::LeaseWarrantyProvider
