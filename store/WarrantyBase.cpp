#include "WarrantyBase.h"

#include "LoggerNames.h"
#include "RecordBaseImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerWarrantyBase = LoggerNames::kept(LoggerNames::provider);

using Property = Properties::Warranty;

const TraceUnit WarrantyStore::unit{loggerWarrantyBase, "WarrantyBase.cpp"};

const RecordStoreTexts WarrantyStore::texts{
    "WarrantyUnit",
    "WarrantyCache",
    "~WarrantyCache",
    "WarrantyBase",
    "~WarrantyBase",
    "selectWarranty",
    "createWarranty",
    "deleteWarranty",
    "Warranty.dat",
    "recordCountWarranty",
    "Zero Warranty Records Available",
    "Warranty record not available",
    "Warranty with the supplied instance Id exists.",
    "Could not open Warranty record.",
};

/** In file order. */
const std::array<RecordField<WarrantyUnit, Property>, 4> WarrantyStore::fields{{
    {Property::InstanceID, &WarrantyUnit::InstanceID, TextForm::identifier},
    {Property::Warrantor, &WarrantyUnit::Warrantor},
    {Property::CommencementDate, &WarrantyUnit::CommencementDate, TextForm::date},
    {Property::Duration, &WarrantyUnit::Duration},
}};

template class RecordTrace<WarrantyStore>;
template class RecordCache<WarrantyStore>;
template class RecordBase<WarrantyStore>;

/** Stands below the logger's name and the tables, which its loading uses. */
WarrantyCache WarrantyBase::cache;

WarrantyCache& WarrantyStore::cache() {
    return WarrantyBase::cache;
}

std::ifstream& operator>>(std::ifstream& source, WarrantyUnit& warranty) {
    const Traced traced(at(WarrantyStore::unit), label::source, &source, label::warranty, &warranty);
    readRecord(source, warranty, WarrantyStore::fields);
    return source;
}

std::size_t bytesOfTexts(const WarrantyUnit& warranty) {
    return bytesOfTexts(warranty, WarrantyStore::fields);
}

std::ofstream& operator<<(std::ofstream& target, const WarrantyUnit& warranty) {
    const Traced traced(at(WarrantyStore::unit), label::target, &target, label::warranty, &warranty);
    writeRecord(target, warranty, WarrantyStore::fields);
    return target;
}

}  // namespace KO::LeaseWarrantyProvider
