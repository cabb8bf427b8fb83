#pragma once

#include <optional>
#include <set>
#include <string>
#include <vector>

#include "lab/load/ExpectedState.h"
#include "lab/load/LoadClass.h"
#include "model/Status.h"

// Checks of responses. Each function returns the first mismatch.

namespace cimhost::lab {

/** The difference between a response and the expected one. */
struct Mismatch {
    std::string kind{};  ///< one word, see tests/lab/README.md
    std::string expected{};
    std::string got{};
};

using CheckResult = std::optional<Mismatch>;  ///< none: the response is right

/** "status" if the code differs. @param code the expected one */
CheckResult checkStatus(const Status& status, int code);

/** "path" if this is not the path of the created instance. */
CheckResult checkPath(const ObjectPath& created, const ObjectPath& expected);

/** "value" if the instance has another identifier, or other values than the expected ones. */
CheckResult checkInstance(const LoadClass& known, const Instance& instance, const std::string& id,
                          const ExpectedState::Values& values);

/** The instances that an enumeration must or may contain. */
struct Expectation {
    const LoadClass& known;
    const std::set<std::string>& others;  ///< identifiers of instances that are not the load's
    const ExpectedState& state;           ///< the load's instances
    std::string own{};                    ///< prefix of identifiers of which the state knows all instances
    std::string any{};                    ///< prefix of all identifiers of the load
};

/**
 * "missing" if an instance is missing, "duplicate" if it is listed twice, "deleted" if it was deleted, "unknown" if no
 * client created it, "nameless" if it has no identifier, and "value" as checkInstance().
 * @param instances of an enumeration of paths, instances without properties
 * @param hasProperties whether the instances have properties
 */
CheckResult checkListing(const Expectation& expectation, const std::vector<Instance>& instances, bool hasProperties);

/** "association" if the paths differ. Both lists are sorted. */
CheckResult checkAssociated(const std::vector<std::string>& now, const std::vector<std::string>& before);

}  // namespace cimhost::lab
