#include "Warranty.h"

#include "RecordElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerWarranty = LoggerNames::loggerName(LoggerNames::provider);

using Property = Properties::Warranty;

const TraceSource WarrantyElementTraits::traceSource{loggerWarranty, "Warranty.cpp"};

const RecordElementNames WarrantyElementTraits::names{"Warranty"};

template class RecordElement<WarrantyElementTraits>;
template bool RecordElement<WarrantyElementTraits>::get(Property, std::string&, const char*, unsigned int) const;
template bool RecordElement<WarrantyElementTraits>::get(Property, unsigned int&, const char*, unsigned int) const;
template void RecordElement<WarrantyElementTraits>::set(Property, const std::string&, const char*, unsigned int);
template void RecordElement<WarrantyElementTraits>::set(Property, const unsigned int&, const char*, unsigned int);

}  // namespace KO::LeaseWarrantyProvider
