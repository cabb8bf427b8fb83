#pragma once

#include <cmpift.h>

#include <filesystem>
#include <memory>
#include <vector>

#include "Requests.h"
#include "Rows.h"

/**
 * The baseline is a minimal provider that loops over plain structs. It has the same function tables, makes the same
 * broker calls and returns the same results as the provider. A change rewrites a file in the provider's format and
 * flushes it after each line, as the provider does.
 *
 * A baseline serves one class and handles only the requests of the benchmarks.
 */
namespace bench {

class Baseline {
public:
    Baseline() = default;
    virtual ~Baseline() = default;
    Baseline(const Baseline&) = delete;
    Baseline& operator=(const Baseline&) = delete;

    /** The interfaces, which the baseline owns. */
    virtual Interfaces interfaces() = 0;
};

/** A baseline for the rows of a table. @param file the file that changes rewrite; unused for products */
template <class Row>
std::unique_ptr<Baseline> makeBaseline(const CMPIBroker* broker, std::vector<Row> rows, std::filesystem::path file);

/** A baseline for the association between the computer and its lease. */
std::unique_ptr<Baseline> makeAssociationBaseline(const CMPIBroker* broker, std::vector<LeaseRow> leases);

}  // namespace bench
