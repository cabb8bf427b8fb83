#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "lab/load/LoadClass.h"
#include "lab/load/Mix.h"

namespace cimhost::lab {

/** The parameters of a load. */
struct Plan {
    std::vector<LoadClass> classes{};  ///< not empty
    unsigned clients = 8;              ///< at least one
    std::size_t requests = 10'000;     ///< of all clients
    std::uint64_t seed = 1;
    Mix mix{};
    std::optional<ObjectPath> source{};  ///< of associations; required if the mix has associations
    std::optional<std::string> associationClass{};
    bool fills = false;        ///< creations have values
    bool keeps = false;        ///< the instances are not deleted at the end
    bool listsChanges = true;  ///< modifications send a property list
    bool probes = true;        ///< some requests are about missing instances, or create existing ones
    std::size_t shown = 10;    ///< number of wrong responses to describe
};

/** @throws PlanError if the plan is not possible */
void requireFeasible(const Plan& plan);

}  // namespace cimhost::lab
