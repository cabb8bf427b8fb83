#pragma once

#include "Holdings.h"
#include "Workbench.h"

#include <cstddef>
#include <functional>
#include <random>
#include <vector>

namespace bench {

/** What is reported of a soak while it goes on: what has been done so far, and what the process holds then. */
using Progress = std::function<void(std::size_t done, const Holdings& now)>;

/**
 * Many requests of all kinds to one loaded provider, in an order that looks random and is always the same.
 *
 * Of each, status and number of answers are checked. There are ten leases and ten warranties all the time; now and then
 * one is created and deleted again. A deleted record stays in the provider's table until the library is unloaded, so
 * memory grows with deletions, and with nothing else.
 */
class Soak {
public:
    /** @param behindGate whether the requests go through the gate */
    Soak(Workbench& workbench, bool behindGate);

    /** Performs requests and reports ten times. @throws std::runtime_error when one is not answered as it is to be */
    void request(std::size_t count, const Progress& progress);

    /** Loads, uses and unloads the library, and the agent's with it, so many times, and reports ten times. */
    void cycle(std::size_t count, const Progress& progress);

    std::size_t deletions() const { return deleted; }

private:
    /** A request, and the status of a right answer to it. */
    struct Question {
        Request request;
        CMPIrc rc = CMPI_RC_OK;
    };
    using Questions = std::vector<Question>;

    static Questions allReads(bool gated);
    static Questions allChanges();
    static Questions allCreations();

    Interfaces load();
    void performOne(const Interfaces& interfaces);
    void createAndDelete(std::size_t number, const Interfaces& interfaces);
    void perform(const Question& question, const Interfaces& interfaces);

    Workbench& bench;
    bool gated;
    std::mt19937_64 random{1};
    Questions reads;
    Questions changes;
    Questions creations;  ///< each followed by the deletion of what was created
    Question assetChange;
    std::size_t deleted = 0;
};

}  // namespace bench
