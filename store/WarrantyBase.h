#pragma once

#include <array>
#include <fstream>
#include <string>

#include "RecordBase.h"

namespace KO::LeaseWarrantyProvider {

namespace Properties {

/** The properties of a warranty record. The numbers are fixed, since they appear in the log. */
enum class Warranty : int {
    InstanceID = 0,
    Warrantor = 1,
    CommencementDate = 2,
    Duration = 3,
};

}  // namespace Properties

struct WarrantyStoreTraits;

/** The terms of one warranty. */
struct WarrantyUnit : private RecordTrace<WarrantyStoreTraits> {
    WarrantyUnit() = default;
    explicit WarrantyUnit(const std::string& instanceId) : RecordTrace(instanceId), InstanceID(instanceId) {}

    bool inUse = true;  ///< false once deleted: the record stays in the table and is skipped
    unsigned int Duration = 0;
    std::string InstanceID;  ///< key, unique among the records in use
    std::string Warrantor;
    std::string CommencementDate;  ///< CIM datetime string
};

/** Reads one record of a warranty file from the stream's position. A field that cannot be read keeps its value. */
std::ifstream& operator>>(std::ifstream& source, WarrantyUnit& warranty);

/** Writes one record of a warranty file: four fields, one per line, each line flushed. */
std::ofstream& operator<<(std::ofstream& target, const WarrantyUnit& warranty);

/** The number of warranties in use, which is the first line of the file. */
struct WarrantyCount {
    unsigned int recordCountWarranty = 0;

    unsigned int& count() { return recordCountWarranty; }
};

/** Traits of warranties for RecordCache and RecordBase. */
struct WarrantyStoreTraits {
    using Unit = WarrantyUnit;
    using Count = WarrantyCount;
    using Property = Properties::Warranty;

    static const TraceSource traceSource;
    static const RecordStoreNames names;
    /** In file order. */
    static constexpr std::array<RecordField<Unit, Property>, 4> fields{{
        {Property::InstanceID, &WarrantyUnit::InstanceID, TextForm::identifier},
        {Property::Warrantor, &WarrantyUnit::Warrantor},
        {Property::CommencementDate, &WarrantyUnit::CommencementDate, TextForm::date},
        {Property::Duration, &WarrantyUnit::Duration},
    }};
};

/** The process-wide warranty table, stored in Warranty.dat. */
using WarrantyCache = RecordCache<WarrantyStoreTraits>;

/** A cursor over the warranty records that can create and delete records. */
class WarrantyBase : public RecordBase<WarrantyStoreTraits> {
public:
    void selectWarranty(const std::string& instanceId) { select(instanceId); }
    bool createWarranty(const std::string& instanceId) { return create(instanceId); }
    void deleteWarranty() { remove(); }
};

template <>
WarrantyCache RecordBase<WarrantyStoreTraits>::cache;

}  // namespace KO::LeaseWarrantyProvider
