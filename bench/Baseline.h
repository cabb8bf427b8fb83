#pragma once

#include <cmpift.h>

#include <filesystem>
#include <memory>
#include <vector>

#include "Requests.h"
#include "Rows.h"

/**
 * The baseline is a loop over plain structs that has the same function tables, makes the same broker calls and returns
 * the same results as the provider. Changes rewrite a file of the provider's format, with a flush per line, as the
 * provider does.
 *
 * A baseline serves one class and expects only the requests of the benchmarks.
 */
namespace bench {

class Baseline {
public:
    Baseline() = default;
    virtual ~Baseline() = default;
    Baseline(const Baseline&) = delete;
    Baseline& operator=(const Baseline&) = delete;

    /** Its interfaces; owned by it. */
    virtual Interfaces interfaces() = 0;
};

/** A baseline for the rows of a table. @param file for changes; unused for products */
template <class Row>
std::unique_ptr<Baseline> makeBaseline(const CMPIBroker* broker, std::vector<Row> rows, std::filesystem::path file);

/** A baseline for the association between the computer and its lease. */
std::unique_ptr<Baseline> makeAssociationBaseline(const CMPIBroker* broker, std::vector<LeaseRow> leases);

}  // namespace bench
