#pragma once

#include <optional>
#include <set>
#include <string>
#include <vector>

#include "lab/load/ExpectedState.h"
#include "lab/load/LoadClass.h"
#include "model/Status.h"

// What is wrong with an answer: nothing, or the first thing that is.

namespace cimhost::lab {

/** Why an answer is wrong. */
struct Mismatch {
    std::string kind{};  ///< one word, see docs/cimhost.md
    std::string expected{};
    std::string got{};
};

using Verdict = std::optional<Mismatch>;

/** "status" when the code is another one. @param code CMPI_RC_OK or the code of the failure that must be answered */
Verdict checkStatus(const Status& status, int code);

/** "path" when that is not the path of the instance that was created. */
Verdict checkPath(const ObjectPath& created, const ObjectPath& expected);

/** "value" when the instance is another one or has other values than those that are known. */
Verdict checkInstance(const LoadClass& known, const Instance& instance, const std::string& id,
                      const ExpectedState::Values& values);

/** What may and what must be in an enumeration. */
struct Expectation {
    const LoadClass& known;
    const std::set<std::string>& others;  ///< identifiers that are there whatever the load does
    const ExpectedState& state;           ///< the instances that are known
    std::string own{};                    ///< what identifiers begin with that only the state tells of
    std::string any{};                    ///< what all identifiers of the load begin with
};

/**
 * "missing" when an instance is not there, "duplicate" when it is there twice, "deleted" when it should not be there,
 * "unknown" when nobody ever made it, "nameless" when it has no identifier, and "value" as above.
 * @param instances of an enumeration of paths, with the paths alone
 * @param hasProperties whether they have their properties, too
 */
Verdict checkListing(const Expectation& expectation, const std::vector<Instance>& instances, bool hasProperties);

/** "association" when other paths are associated than before. Both are sorted. */
Verdict checkAssociated(const std::vector<std::string>& now, const std::vector<std::string>& before);

}  // namespace cimhost::lab
