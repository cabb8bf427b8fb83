#pragma once

#include "RecordBase.h"
#include "RecordFields.h"
#include "WarrantyUnit.h"

#include <array>
#include <string>

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
    static RecordCache<WarrantyStoreTraits>& cache();
};

/** The process-wide warranty table, stored in Warranty.dat. */
using WarrantyCache = RecordCache<WarrantyStoreTraits>;

/** A cursor over the warranty records that can create and delete records. */
class WarrantyBase : public RecordBase<WarrantyStoreTraits> {
public:
    void selectWarranty(const std::string& instanceId) { select(instanceId); }
    bool createWarranty(const std::string& instanceId) { return create(instanceId); }
    void deleteWarranty() { remove(); }

    static WarrantyCache cache;
};

}  // namespace KO::LeaseWarrantyProvider
