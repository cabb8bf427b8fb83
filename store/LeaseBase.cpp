#include "LeaseBase.h"

#include "LoggerNames.h"
#include "RecordBaseImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLeaseBase(LoggerNames::provider);

namespace {

const TraceUnit unit{loggerLeaseBase, "LeaseBase.cpp"};

using Property = Properties::Lease;

/** In file order. */
constexpr LeaseStore::Fields fields{{
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

constexpr RecordStoreTexts texts{
    "Lease.dat",
    "recordCountLease",
    "Zero Lease Records Available",
    "Lease record not available",
    "Lease with the supplied instance Id exists.",
    "Could not open Lease record.",
};

}  // namespace

const TraceUnit& LeaseStore::unit() {
    return LeaseWarrantyProvider::unit;
}

const RecordStoreTexts& LeaseStore::texts() {
    return LeaseWarrantyProvider::texts;
}

const LeaseStore::Fields& LeaseStore::fields() {
    return LeaseWarrantyProvider::fields;
}

LeaseCache& LeaseStore::cache() {
    return LeaseBase::cache;
}

unsigned int& LeaseStore::count() {
    return LeaseBase::cache.recordCountLease;
}

std::vector<LeaseUnit>& LeaseStore::table() {
    return LeaseBase::cache.table;
}

template class RecordTrace<LeaseStore>;
template class RecordBase<LeaseStore>;

/** Stands below the logger's name, with which its loading is traced. */
LeaseCache LeaseBase::cache;

std::ifstream& operator>>(std::ifstream& source, LeaseUnit& lease) {
    const Traced traced(at(unit), label::source, &source, label::lease, &lease);
    readRecord(source, lease, fields);
    return source;
}

std::ofstream& operator<<(std::ofstream& target, const LeaseUnit& lease) {
    const Traced traced(at(unit), label::target, &target, label::lease, &lease);
    writeRecord(target, lease, fields);
    return target;
}

LeaseCache::LeaseCache() {
    const Traced traced(at(unit));
    loadStore(texts, recordCountLease, table);
}

LeaseCache::~LeaseCache() {
    const Traced traced(at(unit));
}

void LeaseCache::flushCache() {
    const Traced traced(at(unit));
    flushStore(at(unit), texts, recordCountLease, table);
}

LeaseBase::LeaseBase() {
    const Traced traced(at(unit));
    positionFirst();
}

LeaseBase::~LeaseBase() noexcept(false) {
    const Traced traced(at(unit));
    rewriteIfModified();
}

void LeaseBase::selectLease(const std::string& instanceId) {
    const Traced traced(at(unit), label::instanceId, instanceId);
    select(instanceId);
}

bool LeaseBase::createLease(const std::string& instanceId) {
    const Traced traced(at(unit), label::instanceId, instanceId);
    if (create(instanceId)) {
        selectLease(instanceId);
    }
    return true;
}

void LeaseBase::deleteLease() {
    const Traced traced(at(unit));
    remove();
}

bool LeaseBase::getProperty(Properties::Lease property, bool& value) const {
    return get(at(unit), property, value);
}

void LeaseBase::setProperty(Properties::Lease property, bool value) {
    set(at(unit), property, value, wrongTypeOrProperty);
}

}  // namespace KO::LeaseWarrantyProvider
