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
 * A request that is measured with the provider and the baseline. It is registered as the benchmarks
 * Operation[.detail]/Class/provider/size, .../baseline/size and .../both/size. The last one alternates between provider
 * and baseline.
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

    /** Loads the provider alone and behind the gate. If set, the benchmark .../gate/size alternates between the two. */
    std::function<std::pair<Interfaces, Interfaces>(Environment&)> twice{};
};

/** The sizes of the tables for reads, and for writes. */
extern const std::vector<std::size_t> readSizes;
extern const std::vector<std::size_t> writeSizes;

/** The size of a table that shows whether times grow linearly. Only a few requests for leases are measured with it. */
constexpr std::size_t largestSize = 1000000;

/** @name The cases */
///@{
std::vector<Case> recordCases();
std::vector<Case> productCases();
std::vector<Case> associationCases();
///@}

/**
 * Registers the benchmarks of a case. The benchmarks check each response, and compare the provider's results with the
 * baseline's. A wrong response ends the benchmark with an error and sets failed.
 */
void registerCase(const Case& one, Environment& environment, bool& failed);

/** Registers benchmarks that load and unload the library, and that read the record file as the baseline does. */
void registerLoading(Environment& environment, bool& failed);

}  // namespace bench
