#pragma once

#include <cstddef>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "Baseline.h"
#include "Environment.h"
#include "Requests.h"

namespace bench {

/**
 * A request that is measured with the provider and the baseline. It is registered as three benchmarks, with names of
 * the form Operation[.detail]/Class/provider/size, .../baseline/size and .../both/size, which alternates between the
 * two.
 */
struct Case {
    std::string operation;
    std::string className;
    std::size_t size = 1;  ///< records in the table
    ExpectedRequest request;
    std::function<Interfaces(Environment&)> provider;  ///< loads the provider with the table that the request needs
    std::function<std::unique_ptr<Baseline>(const Environment&, const CMPIBroker*)> baseline;
    std::string changedFile{};  ///< name of the file that the request changes; empty: none
    std::size_t computers = 1;  ///< computers that the object manager has

    /** Loads the provider alone and behind the gate, for a benchmark that alternates between them: .../gate/size. */
    std::function<std::pair<Interfaces, Interfaces>(Environment&)> twice{};
};

/** The sizes of the tables for reads, and for writes. */
extern const std::vector<std::size_t> readSizes;
extern const std::vector<std::size_t> writeSizes;

/** The size of a table that shows whether times are linear: only leases, and few requests. */
constexpr std::size_t largestSize = 1000000;

/** @name The cases */
///@{
std::vector<Case> recordCases();
std::vector<Case> productCases();
std::vector<Case> associationCases();
///@}

/**
 * Registers the benchmarks of a case. They check each response, and compare the results of the provider with those of
 * the baseline. A wrong response ends the benchmark with an error and sets failed.
 */
void registerCase(const Case& one, Environment& environment, bool& failed);

/** Registers the loading of the library, from dlopen to the end of dlclose, and the reading of the file. */
void registerLoading(Environment& environment, bool& failed);

}  // namespace bench
