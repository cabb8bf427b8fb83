#include "Warranty.h"

#include "LoggerNames.h"
#include "RecordElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerWarranty = LoggerNames::kept(LoggerNames::provider);

using Property = Properties::Warranty;

const TraceUnit WarrantyElement::unit{loggerWarranty, "Warranty.cpp"};

const RecordElementTexts WarrantyElement::texts{
    "Warranty",
    "~Warranty",
    "createWarranty",
    "removeWarranty",
    "Warranty Information",
    "Identify a Warranty to remove.",
    "Could not find Instance ID property on Warranty.",
};

template class RecordElement<WarrantyElement>;

bool Warranty::getWarrantor(std::string& value) const {
    return get(at(WarrantyElement::unit), Property::Warrantor, value);
}

bool Warranty::getCommencementDate(std::string& value) const {
    return get(at(WarrantyElement::unit), Property::CommencementDate, value);
}

bool Warranty::getDuration(unsigned int& value) const {
    return get(at(WarrantyElement::unit), Property::Duration, value);
}

void Warranty::setWarrantor(std::string value) {
    set(at(WarrantyElement::unit), Property::Warrantor, value);
}

void Warranty::setCommencementDate(std::string value) {
    set(at(WarrantyElement::unit), Property::CommencementDate, value);
}

void Warranty::setDuration(unsigned int value) {
    set(at(WarrantyElement::unit), Property::Duration, value);
}

}  // namespace KO::LeaseWarrantyProvider
