#include "LeaseBase.h"

#include "LoggerNames.h"
#include "RecordBaseImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLeaseBase = LoggerNames::kept(LoggerNames::provider);

using Property = Properties::Lease;

const TraceUnit LeaseStore::unit{loggerLeaseBase, "LeaseBase.cpp"};

const RecordStoreTexts LeaseStore::texts{
    "LeaseUnit",
    "LeaseCache",
    "~LeaseCache",
    "LeaseBase",
    "~LeaseBase",
    "selectLease",
    "createLease",
    "deleteLease",
    "Lease.dat",
    "recordCountLease",
    "Zero Lease Records Available",
    "Lease record not available",
    "Lease with the supplied instance Id exists.",
    "Could not open Lease record.",
};

/** In file order. */
const std::array<RecordField<LeaseUnit, Property>, 13> LeaseStore::fields{{
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

template class RecordTrace<LeaseStore>;
template class RecordCache<LeaseStore>;
template class RecordBase<LeaseStore>;

/** Stands below the logger's name and the tables, which its loading uses. */
LeaseCache LeaseBase::cache;

LeaseCache& LeaseStore::cache() {
    return LeaseBase::cache;
}

std::ifstream& operator>>(std::ifstream& source, LeaseUnit& lease) {
    const Traced traced(at(LeaseStore::unit), label::source, &source, label::lease, &lease);
    readRecord(source, lease, LeaseStore::fields);
    return source;
}

std::size_t bytesOfTexts(const LeaseUnit& lease) {
    return bytesOfTexts(lease, LeaseStore::fields);
}

std::ofstream& operator<<(std::ofstream& target, const LeaseUnit& lease) {
    const Traced traced(at(LeaseStore::unit), label::target, &target, label::lease, &lease);
    writeRecord(target, lease, LeaseStore::fields);
    return target;
}

bool LeaseBase::getProperty(Properties::Lease property, bool& value) const {
    return get(at(LeaseStore::unit), property, value);
}

void LeaseBase::setProperty(Properties::Lease property, bool value) {
    set(at(LeaseStore::unit), property, value, wrongTypeOrProperty);
}

}  // namespace KO::LeaseWarrantyProvider
