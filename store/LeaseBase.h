#pragma once

#include "LeaseUnit.h"
#include "RecordBase.h"
#include "RecordFields.h"

#include <array>
#include <string>
#include <vector>

namespace KO::LeaseWarrantyProvider {

namespace Properties {

/** The properties of a lease record. The numbers are fixed: they stand in the log. */
enum class Lease : int {
    InstanceID = 0,
    LeaseTerm = 1,
    NetMonthlyLeaseRateFactor = 2,
    Lessor = 3,
    BaseTermCommencementDate = 4,
    BaseRent = 5,
    FairMarketRental = 6,
    FairMarketValue = 7,
    TerminationValue = 8,
    EarlyTerminationOption = 9,
    FixedPricePurchaseOption = 10,
    RenewalOption = 11,
    BargainRenewalOption = 12,
};

}  // namespace Properties

/**
 * The lease table of the process. It is loaded from Lease.dat once, with the library, and written
 * back by whoever changes it. The count is always the number of records in use.
 */
class LeaseCache {
public:
    /** Loads the file; an absent or unreadable one gives an empty table. */
    LeaseCache();
    /** Releases the table. The file is not written. */
    ~LeaseCache();
    LeaseCache(const LeaseCache&) = delete;
    LeaseCache& operator=(const LeaseCache&) = delete;

    /** Rewrites the file from the table. Throws InstrumentationException when it cannot be opened. */
    void flushCache();

    unsigned int recordCountLease = 0;
    std::vector<LeaseUnit> table;  ///< in file order, new records at the end, deleted ones included
};

/** What the design shared with the warranty store needs to know of leases. */
struct LeaseStore {
    using Unit = LeaseUnit;
    using Property = Properties::Lease;
    using Fields = std::array<RecordField<LeaseUnit, Properties::Lease>, 13>;
    static constexpr const char* unitName = "LeaseUnit";

    static const TraceUnit& unit();
    static const RecordStoreTexts& texts();
    static const Fields& fields();
    static LeaseCache& cache();
    static unsigned int& count();
    static std::vector<LeaseUnit>& table();
};

/** A cursor over the lease records, with creation and deletion. One belongs to one request. */
class LeaseBase : public RecordBase<LeaseStore> {
public:
    /** Stands on the first lease. Throws InstrumentationException when the count tells of leases and there are none. */
    LeaseBase();

    /** Rewrites Lease.dat if this cursor changed anything; that may throw. */
    ~LeaseBase() noexcept(false);

    /** Moves forward to the lease with the identifier, compared byte for byte, or to the end. */
    void selectLease(const std::string& instanceId);

    /**
     * Appends a lease with its identifier and default terms. A cursor that stood on an entry then
     * stands on the new one, a cursor at the end on the first of the table.
     * @return true
     * @throws InstrumentationException when a lease with the identifier exists
     */
    bool createLease(const std::string& instanceId);

    /** Deletes the current lease; the cursor stays. Throws InstrumentationException when there is none. */
    void deleteLease();

    using RecordBase::getProperty;
    using RecordBase::setProperty;
    bool getProperty(Properties::Lease property, bool& value) const;
    void setProperty(Properties::Lease property, bool value);

    static LeaseCache cache;
};

}  // namespace KO::LeaseWarrantyProvider
