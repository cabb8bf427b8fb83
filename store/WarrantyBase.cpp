#include "WarrantyBase.h"

#include "RecordBaseImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerWarrantyBase = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource WarrantyStoreTraits::traceSource{loggerWarrantyBase, "WarrantyBase.cpp"};

const RecordStoreNames WarrantyStoreTraits::names{"Warranty"};

template class RecordTrace<WarrantyStoreTraits>;
template class RecordCache<WarrantyStoreTraits>;
template class RecordBase<WarrantyStoreTraits>;

/** Defined after the logger's name, the trace source and the names, which its constructor uses. */
template <>
WarrantyCache RecordBase<WarrantyStoreTraits>::cache{};

std::ifstream& operator>>(std::ifstream& source, WarrantyUnit& warranty) {
    const Traced traced(at(WarrantyStoreTraits::traceSource), label::source, &source, label::warranty, &warranty);
    readRecord(source, warranty, WarrantyStoreTraits::fields);
    return source;
}

std::ofstream& operator<<(std::ofstream& target, const WarrantyUnit& warranty) {
    const Traced traced(at(WarrantyStoreTraits::traceSource), label::target, &target, label::warranty, &warranty);
    writeRecord(target, warranty, WarrantyStoreTraits::fields);
    return target;
}

}  // namespace KO::LeaseWarrantyProvider
