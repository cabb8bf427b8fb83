#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "lab/load/LoadClass.h"
#include "lab/load/Mix.h"

namespace cimhost::lab {

/** What a load does. */
struct Plan {
    std::vector<LoadClass> classes{};  ///< not empty
    unsigned clients = 8;              ///< at least one
    std::size_t requests = 10'000;     ///< of all clients
    std::uint64_t seed = 1;
    Mix mix{};
    std::optional<ObjectPath> source{};  ///< whose associations are asked for; needed if the mix has associations
    std::optional<std::string> associationClass{};
    bool fills = false;        ///< values go along at creation
    bool keeps = false;        ///< what is there at the end stays there
    bool listsChanges = true;  ///< modifications send the list of what they change
    bool probes = true;        ///< now and then asks for what is not there, and creates what is there already
    std::size_t shown = 10;    ///< how many wrong answers are told in words
};

/** PlanError when the plan asks for what cannot be done. */
void requireFeasible(const Plan& plan);

}  // namespace cimhost::lab
