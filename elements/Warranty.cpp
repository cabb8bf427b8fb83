#include "Warranty.h"

#include "RecordElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerWarranty = LoggerNames::loggerName(LoggerNames::provider);

using Property = Properties::Warranty;

const TraceSource WarrantyElementTraits::traceSource{loggerWarranty, "Warranty.cpp"};

const RecordElementNames WarrantyElementTraits::names{"Warranty"};

template class RecordElement<WarrantyElementTraits>;

bool Warranty::getWarrantor(std::string& value) const {
    return get(at(WarrantyElementTraits::traceSource), Property::Warrantor, value);
}

bool Warranty::getCommencementDate(std::string& value) const {
    return get(at(WarrantyElementTraits::traceSource), Property::CommencementDate, value);
}

bool Warranty::getDuration(unsigned int& value) const {
    return get(at(WarrantyElementTraits::traceSource), Property::Duration, value);
}

void Warranty::setWarrantor(std::string value) {
    set(at(WarrantyElementTraits::traceSource), Property::Warrantor, value);
}

void Warranty::setCommencementDate(std::string value) {
    set(at(WarrantyElementTraits::traceSource), Property::CommencementDate, value);
}

void Warranty::setDuration(unsigned int value) {
    set(at(WarrantyElementTraits::traceSource), Property::Duration, value);
}

}  // namespace KO::LeaseWarrantyProvider
