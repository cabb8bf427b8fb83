#pragma once

#include "RecordTrace.h"

#include <cstddef>
#include <fstream>
#include <string>

namespace KO::LeaseWarrantyProvider {

struct LeaseStoreTraits;

/**
 * The terms of one lease. Money amounts are text; nothing here interprets them.
 */
struct LeaseUnit : private RecordTrace<LeaseStoreTraits> {
    LeaseUnit() = default;
    explicit LeaseUnit(const std::string& instanceId) : RecordTrace(instanceId), InstanceID(instanceId) {}

    bool inUse = true;  ///< false once deleted: the record stays in the table and is passed over
    bool EarlyTerminationOption = false;
    bool FixedPricePurchaseOption = false;
    bool RenewalOption = false;
    bool BargainRenewalOption = false;
    unsigned int LeaseTerm = 0;
    unsigned int NetMonthlyLeaseRateFactor = 0;
    std::string InstanceID;  ///< the key, unique among the records in use
    std::string Lessor;
    std::string BaseRent;
    std::string BaseTermCommencementDate;  ///< CIM datetime text
    std::string FairMarketRental;
    std::string FairMarketValue;
    std::string TerminationValue;
};

/** Reads one record of a lease file from where the stream stands. A field that cannot be read keeps its value. */
std::ifstream& operator>>(std::ifstream& source, LeaseUnit& lease);

/** Bytes of memory that a copy of the record takes beside the record itself, for its texts. */
std::size_t bytesOfTexts(const LeaseUnit& lease);

/** Writes one record of a lease file: thirteen fields, one a line, each flushed. */
std::ofstream& operator<<(std::ofstream& target, const LeaseUnit& lease);

}  // namespace KO::LeaseWarrantyProvider
