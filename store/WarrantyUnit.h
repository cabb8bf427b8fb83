#pragma once

#include "RecordTrace.h"

#include <cstddef>
#include <fstream>
#include <string>

namespace KO::LeaseWarrantyProvider {

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

/** Returns the number of bytes that a copy of the record allocates for its strings. */
std::size_t bytesOfTexts(const WarrantyUnit& warranty);

/** Writes one record of a warranty file: four fields, one per line, each line flushed. */
std::ofstream& operator<<(std::ofstream& target, const WarrantyUnit& warranty);

}  // namespace KO::LeaseWarrantyProvider
