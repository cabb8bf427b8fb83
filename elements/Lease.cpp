#include "Lease.h"

#include "LoggerNames.h"
#include "RecordElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLease = LoggerNames::kept(LoggerNames::provider);

using Property = Properties::Lease;

const TraceUnit LeaseElement::unit{loggerLease, "Lease.cpp"};

const RecordElementTexts LeaseElement::texts{
    "Lease",
    "~Lease",
    "createLease",
    "removeLease",
    "Lease Information",
    "Identify a Lease to remove.",
    "Could not find Instance ID property on Lease.",
};

template class RecordElement<LeaseElement>;

bool Lease::getLessor(std::string& value) const {
    return get(at(LeaseElement::unit), Property::Lessor, value);
}

bool Lease::getBaseTermCommencementDate(std::string& value) const {
    return get(at(LeaseElement::unit), Property::BaseTermCommencementDate, value);
}

bool Lease::getBaseRent(std::string& value) const {
    return get(at(LeaseElement::unit), Property::BaseRent, value);
}

bool Lease::getFairMarketRental(std::string& value) const {
    return get(at(LeaseElement::unit), Property::FairMarketRental, value);
}

bool Lease::getFairMarketValue(std::string& value) const {
    return get(at(LeaseElement::unit), Property::FairMarketValue, value);
}

bool Lease::getTerminationValue(std::string& value) const {
    return get(at(LeaseElement::unit), Property::TerminationValue, value);
}

bool Lease::getLeaseTerm(unsigned int& value) const {
    return get(at(LeaseElement::unit), Property::LeaseTerm, value);
}

bool Lease::getNetMonthlyLeaseRateFactor(unsigned int& value) const {
    return get(at(LeaseElement::unit), Property::NetMonthlyLeaseRateFactor, value);
}

bool Lease::getEarlyTerminationOption(bool& value) const {
    return get(at(LeaseElement::unit), Property::EarlyTerminationOption, value);
}

bool Lease::getFixedPricePurchaseOption(bool& value) const {
    return get(at(LeaseElement::unit), Property::FixedPricePurchaseOption, value);
}

bool Lease::getRenewalOption(bool& value) const {
    return get(at(LeaseElement::unit), Property::RenewalOption, value);
}

bool Lease::getBargainRenewalOption(bool& value) const {
    return get(at(LeaseElement::unit), Property::BargainRenewalOption, value);
}

void Lease::setLessor(std::string value) {
    set(at(LeaseElement::unit), Property::Lessor, value);
}

void Lease::setBaseTermCommencementDate(std::string value) {
    set(at(LeaseElement::unit), Property::BaseTermCommencementDate, value);
}

void Lease::setBaseRent(std::string value) {
    set(at(LeaseElement::unit), Property::BaseRent, value);
}

void Lease::setFairMarketRental(std::string value) {
    set(at(LeaseElement::unit), Property::FairMarketRental, value);
}

void Lease::setFairMarketValue(std::string value) {
    set(at(LeaseElement::unit), Property::FairMarketValue, value);
}

void Lease::setTerminationValue(std::string value) {
    set(at(LeaseElement::unit), Property::TerminationValue, value);
}

void Lease::setLeaseTerm(unsigned int value) {
    set(at(LeaseElement::unit), Property::LeaseTerm, value);
}

void Lease::setNetMonthlyLeaseRateFactor(unsigned int value) {
    set(at(LeaseElement::unit), Property::NetMonthlyLeaseRateFactor, value);
}

void Lease::setEarlyTerminationOption(bool value) {
    set(at(LeaseElement::unit), Property::EarlyTerminationOption, value);
}

void Lease::setFixedPricePurchaseOption(bool value) {
    set(at(LeaseElement::unit), Property::FixedPricePurchaseOption, value);
}

void Lease::setRenewalOption(bool value) {
    set(at(LeaseElement::unit), Property::RenewalOption, value);
}

void Lease::setBargainRenewalOption(bool value) {
    set(at(LeaseElement::unit), Property::BargainRenewalOption, value);
}

}  // namespace KO::LeaseWarrantyProvider
