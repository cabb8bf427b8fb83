#pragma once

#include <cstddef>
#include <functional>
#include <random>
#include <vector>

#include "Environment.h"
#include "ProcessResources.h"

namespace bench {

/** Receives the number of finished requests or cycles and the current resources of the process. */
using Progress = std::function<void(std::size_t done, const ProcessResources& now)>;

/**
 * Sends many requests of all kinds to one provider, in a pseudorandom order that is the same in each run. Checks the
 * status and the number of results.
 *
 * The provider has ten leases and ten warranties. Some requests create another record and delete it. A deleted record
 * stays in the provider's table until the library is unloaded, so memory may grow, but only with each deletion.
 */
class Soak {
public:
    Soak(Environment& itsEnvironment, bool behindGate);

    /** Sends requests and reports progress ten times. @throws std::runtime_error after a wrong response */
    void request(std::size_t count, const Progress& progress);

    /** Loads, uses and unloads the library and the agent's libraries repeatedly. Reports progress ten times. */
    void cycle(std::size_t count, const Progress& progress);

    std::size_t deletions() const { return deleted; }

private:
    using Requests = std::vector<ExpectedRequest>;

    static Requests allReads(bool gated);
    static Requests allChanges();
    static Requests allCreations();

    Interfaces load();
    void performOne(const Interfaces& interfaces);
    void createAndDelete(std::size_t number, const Interfaces& interfaces);
    void perform(const ExpectedRequest& request, const Interfaces& interfaces);

    Environment& environment;
    bool gated;
    std::mt19937_64 random{1};
    Requests reads;
    Requests changes;
    Requests creations;  ///< each followed by the deletion of the new instance
    ExpectedRequest assetChange;
    std::size_t deleted = 0;
};

}  // namespace bench
