#pragma once

#include "Floor.h"
#include "Requests.h"
#include "Workbench.h"

#include <cstddef>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace bench {

/**
 * One thing that is measured of the provider and of the floor alike. Registered as three benchmarks, with names of the
 * form Operation[.detail]/Class/provider/size, .../floor/size and .../both/size, which asks the two in turn.
 */
struct Case {
    std::string operation;
    std::string className;
    std::size_t size = 1;  ///< records in the table
    Request request;
    std::function<Interfaces(Workbench&)> provider;  ///< gives the provider, with the table that the request needs
    std::function<std::unique_ptr<Floor>(const Workbench&, const CMPIBroker*)> floor;
    std::string changedFile{};  ///< of a request that changes records: name of the file, else empty
    std::size_t computers = 1;  ///< that the object manager knows of

    /** Gives the provider alone and behind the gate, where the two are measured side by side: .../gate/size. */
    std::function<std::pair<Interfaces, Interfaces>(Workbench&)> twice{};
};

/** The sizes of tables whose records are read, and of those that are written. */
extern const std::vector<std::size_t> readSizes;
extern const std::vector<std::size_t> writeSizes;

/** The size of a table that shows whether all stays linear: only of leases, and of few requests. */
constexpr std::size_t largestSize = 1000000;

/** @name The cases */
///@{
std::vector<Case> recordCases();
std::vector<Case> productCases();
std::vector<Case> associationCases();
///@}

/**
 * Registers a case's benchmarks. Each checks every answer that it measures, and those of the provider are held
 * against the floor's, as a whole; a wrong one ends the benchmark with an error and sets failed.
 */
void registerCase(const Case& one, Workbench& workbench, bool& failed);

/** Registers the loading of the library: from dlopen to the end of dlclose, against reading the file. */
void registerLoading(Workbench& workbench, bool& failed);

}  // namespace bench
