#include "Lease.h"

#include "RecordElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLease = LoggerNames::loggerName(LoggerNames::provider);

using Property = Properties::Lease;

const TraceSource LeaseElementTraits::traceSource{loggerLease, "Lease.cpp"};

const RecordElementNames LeaseElementTraits::names{"Lease"};

template class RecordElement<LeaseElementTraits>;
template bool RecordElement<LeaseElementTraits>::get(Property, std::string&, const char*, unsigned int) const;
template bool RecordElement<LeaseElementTraits>::get(Property, unsigned int&, const char*, unsigned int) const;
template bool RecordElement<LeaseElementTraits>::get(Property, bool&, const char*, unsigned int) const;
template void RecordElement<LeaseElementTraits>::set(Property, const std::string&, const char*, unsigned int);
template void RecordElement<LeaseElementTraits>::set(Property, const unsigned int&, const char*, unsigned int);
template void RecordElement<LeaseElementTraits>::set(Property, const bool&, const char*, unsigned int);

}  // namespace KO::LeaseWarrantyProvider
