#include "Lease.h"

#include "LoggerNames.h"
#include "RecordElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLease(LoggerNames::provider);

namespace {

const TraceUnit unit{loggerLease, "Lease.cpp"};

using Property = Properties::Lease;

constexpr RecordElementTexts texts{
    "Lease Information",
    "Identify a Lease to remove.",
    "Could not find Instance ID property on Lease.",
};

}  // namespace

const TraceUnit& LeaseElement::unit() {
    return LeaseWarrantyProvider::unit;
}

const RecordElementTexts& LeaseElement::texts() {
    return LeaseWarrantyProvider::texts;
}

template class RecordElement<LeaseElement>;

Lease::Lease() {
    const Traced traced(at(unit));
}

Lease::~Lease() noexcept(false) {
    const Traced traced(at(unit));
}

bool Lease::createLease(std::string instanceId) {
    const Traced traced(at(unit), label::instanceId, instanceId);
    return base.createLease(instanceId);
}

void Lease::removeLease() {
    const Traced traced(at(unit));
    requireFilter(at(unit));
    base.deleteLease();
}

bool Lease::getLessor(std::string& value) const {
    return get(at(unit), Property::Lessor, value);
}

bool Lease::getBaseTermCommencementDate(std::string& value) const {
    return get(at(unit), Property::BaseTermCommencementDate, value);
}

bool Lease::getBaseRent(std::string& value) const {
    return get(at(unit), Property::BaseRent, value);
}

bool Lease::getFairMarketRental(std::string& value) const {
    return get(at(unit), Property::FairMarketRental, value);
}

bool Lease::getFairMarketValue(std::string& value) const {
    return get(at(unit), Property::FairMarketValue, value);
}

bool Lease::getTerminationValue(std::string& value) const {
    return get(at(unit), Property::TerminationValue, value);
}

bool Lease::getLeaseTerm(unsigned int& value) const {
    return get(at(unit), Property::LeaseTerm, value);
}

bool Lease::getNetMonthlyLeaseRateFactor(unsigned int& value) const {
    return get(at(unit), Property::NetMonthlyLeaseRateFactor, value);
}

bool Lease::getEarlyTerminationOption(bool& value) const {
    return get(at(unit), Property::EarlyTerminationOption, value);
}

bool Lease::getFixedPricePurchaseOption(bool& value) const {
    return get(at(unit), Property::FixedPricePurchaseOption, value);
}

bool Lease::getRenewalOption(bool& value) const {
    return get(at(unit), Property::RenewalOption, value);
}

bool Lease::getBargainRenewalOption(bool& value) const {
    return get(at(unit), Property::BargainRenewalOption, value);
}

void Lease::setLessor(std::string value) {
    set(at(unit), Property::Lessor, value);
}

void Lease::setBaseTermCommencementDate(std::string value) {
    set(at(unit), Property::BaseTermCommencementDate, value);
}

void Lease::setBaseRent(std::string value) {
    set(at(unit), Property::BaseRent, value);
}

void Lease::setFairMarketRental(std::string value) {
    set(at(unit), Property::FairMarketRental, value);
}

void Lease::setFairMarketValue(std::string value) {
    set(at(unit), Property::FairMarketValue, value);
}

void Lease::setTerminationValue(std::string value) {
    set(at(unit), Property::TerminationValue, value);
}

void Lease::setLeaseTerm(unsigned int value) {
    set(at(unit), Property::LeaseTerm, value);
}

void Lease::setNetMonthlyLeaseRateFactor(unsigned int value) {
    set(at(unit), Property::NetMonthlyLeaseRateFactor, value);
}

void Lease::setEarlyTerminationOption(bool value) {
    set(at(unit), Property::EarlyTerminationOption, value);
}

void Lease::setFixedPricePurchaseOption(bool value) {
    set(at(unit), Property::FixedPricePurchaseOption, value);
}

void Lease::setRenewalOption(bool value) {
    set(at(unit), Property::RenewalOption, value);
}

void Lease::setBargainRenewalOption(bool value) {
    set(at(unit), Property::BargainRenewalOption, value);
}

}  // namespace KO::LeaseWarrantyProvider
