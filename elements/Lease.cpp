#include "Lease.h"

#include "RecordElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLease = LoggerNames::loggerName(LoggerNames::provider);

using Property = Properties::Lease;

const TraceSource LeaseElementTraits::traceSource{loggerLease, "Lease.cpp"};

const RecordElementNames LeaseElementTraits::names{"Lease"};

template class RecordElement<LeaseElementTraits>;

bool Lease::getLessor(std::string& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::Lessor, value);
}

bool Lease::getBaseTermCommencementDate(std::string& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::BaseTermCommencementDate, value);
}

bool Lease::getBaseRent(std::string& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::BaseRent, value);
}

bool Lease::getFairMarketRental(std::string& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::FairMarketRental, value);
}

bool Lease::getFairMarketValue(std::string& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::FairMarketValue, value);
}

bool Lease::getTerminationValue(std::string& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::TerminationValue, value);
}

bool Lease::getLeaseTerm(unsigned int& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::LeaseTerm, value);
}

bool Lease::getNetMonthlyLeaseRateFactor(unsigned int& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::NetMonthlyLeaseRateFactor, value);
}

bool Lease::getEarlyTerminationOption(bool& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::EarlyTerminationOption, value);
}

bool Lease::getFixedPricePurchaseOption(bool& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::FixedPricePurchaseOption, value);
}

bool Lease::getRenewalOption(bool& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::RenewalOption, value);
}

bool Lease::getBargainRenewalOption(bool& value) const {
    return get(at(LeaseElementTraits::traceSource), Property::BargainRenewalOption, value);
}

void Lease::setLessor(std::string value) {
    set(at(LeaseElementTraits::traceSource), Property::Lessor, value);
}

void Lease::setBaseTermCommencementDate(std::string value) {
    set(at(LeaseElementTraits::traceSource), Property::BaseTermCommencementDate, value);
}

void Lease::setBaseRent(std::string value) {
    set(at(LeaseElementTraits::traceSource), Property::BaseRent, value);
}

void Lease::setFairMarketRental(std::string value) {
    set(at(LeaseElementTraits::traceSource), Property::FairMarketRental, value);
}

void Lease::setFairMarketValue(std::string value) {
    set(at(LeaseElementTraits::traceSource), Property::FairMarketValue, value);
}

void Lease::setTerminationValue(std::string value) {
    set(at(LeaseElementTraits::traceSource), Property::TerminationValue, value);
}

void Lease::setLeaseTerm(unsigned int value) {
    set(at(LeaseElementTraits::traceSource), Property::LeaseTerm, value);
}

void Lease::setNetMonthlyLeaseRateFactor(unsigned int value) {
    set(at(LeaseElementTraits::traceSource), Property::NetMonthlyLeaseRateFactor, value);
}

void Lease::setEarlyTerminationOption(bool value) {
    set(at(LeaseElementTraits::traceSource), Property::EarlyTerminationOption, value);
}

void Lease::setFixedPricePurchaseOption(bool value) {
    set(at(LeaseElementTraits::traceSource), Property::FixedPricePurchaseOption, value);
}

void Lease::setRenewalOption(bool value) {
    set(at(LeaseElementTraits::traceSource), Property::RenewalOption, value);
}

void Lease::setBargainRenewalOption(bool value) {
    set(at(LeaseElementTraits::traceSource), Property::BargainRenewalOption, value);
}

}  // namespace KO::LeaseWarrantyProvider
