#pragma once

#include <array>
#include <set>
#include <string>
#include <vector>

#include "lab/load/Plan.h"
#include "operations/ObjectManager.h"

namespace cimhost::lab {

/** The association operations that a load uses. */
constexpr std::array associationOperations{Operation::associators, Operation::associatorNames, Operation::references,
                                           Operation::referenceNames};

/** The response to an association operation before the load: OK with sorted paths, or not supported. */
struct Associated {
    int code = CMPI_RC_OK;
    std::vector<std::string> paths{};
};

/** The state before the load. The load must not change it. */
struct InitialState {
    std::string prefix{};                      ///< of the load's identifiers; no other identifier begins with it
    std::vector<std::set<std::string>> ids{};  ///< of the existing instances, by class of the plan
    std::array<Associated, associationOperations.size()> associated{};
};

/** Reads the state, with one request after the other. @return the status of the first request that fails */
StatusOr<InitialState> readInitialState(ObjectManager& manager, const Plan& plan);

/** The results of an enumeration. Paths become instances without properties. */
std::vector<Instance> listed(const Response& response);

/** The sorted paths of an association operation's results, without those of the load's instances. */
std::vector<std::string> associated(const Response& response, const std::string& prefix);

}  // namespace cimhost::lab
