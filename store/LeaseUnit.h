#pragma once

#include "RecordTrace.h"

#include <cstddef>
#include <fstream>
#include <string>

namespace KO::LeaseWarrantyProvider {

struct LeaseStoreTraits;

/** The terms of one lease. Amounts of money are strings and are not parsed. */
struct LeaseUnit : private RecordTrace<LeaseStoreTraits> {
    LeaseUnit() = default;
    explicit LeaseUnit(const std::string& instanceId) : RecordTrace(instanceId), InstanceID(instanceId) {}

    bool inUse = true;  ///< false once deleted: the record stays in the table and is skipped
    bool EarlyTerminationOption = false;
    bool FixedPricePurchaseOption = false;
    bool RenewalOption = false;
    bool BargainRenewalOption = false;
    unsigned int LeaseTerm = 0;
    unsigned int NetMonthlyLeaseRateFactor = 0;
    std::string InstanceID;  ///< key, unique among the records in use
    std::string Lessor;
    std::string BaseRent;
    std::string BaseTermCommencementDate;  ///< CIM datetime string
    std::string FairMarketRental;
    std::string FairMarketValue;
    std::string TerminationValue;
};

/** Reads one record of a lease file from the stream's position. A field that cannot be read keeps its value. */
std::ifstream& operator>>(std::ifstream& source, LeaseUnit& lease);

/** Returns the number of bytes that a copy of the record allocates for its strings. */
std::size_t bytesOfTexts(const LeaseUnit& lease);

/** Writes one record of a lease file: thirteen fields, one per line, each line flushed. */
std::ofstream& operator<<(std::ofstream& target, const LeaseUnit& lease);

}  // namespace KO::LeaseWarrantyProvider
