#include "LeaseBase.h"

#include "RecordBaseImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLeaseBase = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource LeaseStoreTraits::traceSource{loggerLeaseBase, "LeaseBase.cpp"};

const RecordStoreNames LeaseStoreTraits::names{"Lease"};

template class RecordTrace<LeaseStoreTraits>;
template class RecordCache<LeaseStoreTraits>;
template class RecordBase<LeaseStoreTraits>;

/** Defined after the logger's name, the trace source and the names, which its constructor uses. */
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

bool LeaseBase::getProperty(Properties::Lease property, bool& value) const {
    return get(at(LeaseStoreTraits::traceSource), property, value);
}

void LeaseBase::setProperty(Properties::Lease property, bool value) {
    set(at(LeaseStoreTraits::traceSource), property, value, wrongTypeOrProperty);
}

}  // namespace KO::LeaseWarrantyProvider
