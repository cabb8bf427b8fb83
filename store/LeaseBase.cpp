#include "LeaseBase.h"

#include "RecordBaseImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLeaseBase = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource LeaseStoreTraits::traceSource{loggerLeaseBase, "LeaseBase.cpp"};

const RecordStoreNames LeaseStoreTraits::names{"Lease"};

template class RecordTrace<LeaseStoreTraits>;
template class RecordCache<LeaseStoreTraits>;
template class RecordBase<LeaseStoreTraits>;
template bool RecordBase<LeaseStoreTraits>::get(Properties::Lease, std::string&, const char*, unsigned int) const;
template bool RecordBase<LeaseStoreTraits>::get(Properties::Lease, unsigned int&, const char*, unsigned int) const;
template bool RecordBase<LeaseStoreTraits>::get(Properties::Lease, bool&, const char*, unsigned int) const;
template void RecordBase<LeaseStoreTraits>::set(Properties::Lease, const std::string&, const char*, unsigned int);
template void RecordBase<LeaseStoreTraits>::set(Properties::Lease, const unsigned int&, const char*, unsigned int);
template void RecordBase<LeaseStoreTraits>::set(Properties::Lease, const bool&, const char*, unsigned int);

/** Defined after the logger's name and the tables, which its constructor uses. */
template <>
LeaseCache RecordBase<LeaseStoreTraits>::cache{};

std::ifstream& operator>>(std::ifstream& source, LeaseUnit& lease) {
    const Traced traced(at(LeaseStoreTraits::traceSource), label::source, &source, label::lease, &lease);
    readRecord(source, lease, LeaseStoreTraits::fields);
    return source;
}

std::ofstream& operator<<(std::ofstream& target, const LeaseUnit& lease) {
    const Traced traced(at(LeaseStoreTraits::traceSource), label::target, &target, label::lease, &lease);
    writeRecord(target, lease, LeaseStoreTraits::fields);
    return target;
}

}  // namespace KO::LeaseWarrantyProvider
