#pragma once

#include <array>
#include <set>
#include <string>
#include <vector>

#include "lab/load/Plan.h"
#include "operations/ObjectManager.h"

namespace cimhost::lab {

/** The association operations, which a load asks in turn. */
constexpr std::array associationOperations{Operation::associators, Operation::associatorNames, Operation::references,
                                           Operation::referenceNames};

/** What an association operation answered before the load: OK with paths, sorted, or that it is not supported. */
struct Associated {
    int code = CMPI_RC_OK;
    std::vector<std::string> paths{};
};

/** How things were before the load, and must stay. */
struct Baseline {
    std::string prefix{};                      ///< with which the load's identifiers begin; nobody else's do
    std::vector<std::set<std::string>> ids{};  ///< of the instances that were there, by class of the plan
    std::array<Associated, associationOperations.size()> associated{};
};

/** Asks for it, with one request after the other. A status other than OK when an answer is a failure. */
StatusOr<Baseline> takeBaseline(ObjectManager& manager, const Plan& plan);

/** The results of an enumeration; paths are instances without properties. */
std::vector<Instance> listed(const Response& response);

/** The paths of an association operation's results, sorted, without those of the load's own instances. */
std::vector<std::string> associated(const Response& response, const std::string& prefix);

}  // namespace cimhost::lab
