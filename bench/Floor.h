#pragma once

#include "Requests.h"
#include "Rows.h"

#include <cmpift.h>

#include <filesystem>
#include <memory>
#include <vector>

/**
 * The floor: what the same answers cost without provider, records and tracing. It answers through the same function
 * tables and makes the same broker calls as the provider, in bare loops over plain structs. Changes rewrite a file of
 * the provider's format, line by line and flushed, as the provider does.
 *
 * A floor serves one class, checks nothing, and expects the requests that the benchmarks make.
 */
namespace bench {

class Floor {
public:
    Floor() = default;
    virtual ~Floor() = default;
    Floor(const Floor&) = delete;
    Floor& operator=(const Floor&) = delete;

    /** Its interfaces; they belong to it. */
    virtual Interfaces interfaces() = 0;
};

/** A floor that serves the rows of a table. @param file where changes are written; of no use for products */
template <class Row>
std::unique_ptr<Floor> makeFloor(const CMPIBroker* broker, std::vector<Row> rows, std::filesystem::path file);

/** A floor that serves the association between the computer and its lease. */
std::unique_ptr<Floor> makeAssociationFloor(const CMPIBroker* broker, std::vector<LeaseRow> leases);

}  // namespace bench
