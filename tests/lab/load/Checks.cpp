#include "lab/load/Checks.h"

#include <algorithm>

#include "broker/NamedValues.h"
#include "cim/Names.h"
#include "lab/load/Values.h"
#include "operations/StatusText.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"
#include "schema/StringLiteral.h"

namespace cimhost::lab {
namespace {

bool beginsWith(const std::string& id, const std::string& prefix) {
    return id.compare(0, prefix.size(), prefix) == 0;
}

std::string describe(const Status& status) {
    return status.ok() ? "OK" : errorText(status);
}

std::optional<std::string> idOf(const LoadClass& known, const Instance& instance) {
    const std::optional<std::string> inPath = known.idIn(instance.path.keys);
    return inPath ? inPath : known.idIn(instance.properties);
}

/** Checks one instance of an enumeration. */
CheckResult checkListed(const Expectation& expectation, const std::string& id, const Instance* instance) {
    const auto& known = expectation.state.instances();
    const auto found = known.find(id);
    if (found != known.end()) {
        return instance == nullptr ? std::nullopt : checkInstance(expectation.known, *instance, id, found->second);
    }
    if (beginsWith(id, expectation.own)) {
        return expectation.state.isDoubtful(id)
                   ? std::nullopt
                   : CheckResult(Mismatch{"deleted", "no instance " + id, "a deleted instance"});
    }
    const bool isAllowed = beginsWith(id, expectation.any) || expectation.others.count(id) != 0;
    return isAllowed ? std::nullopt
                     : CheckResult(Mismatch{"unknown", "only instances that clients created", inQuotes(id)});
}

template <class Ids, class IdOf>
CheckResult checkNoneMissing(const Ids& ids, const std::set<std::string>& listed, IdOf idOf) {
    const auto missing =
        std::find_if(ids.begin(), ids.end(), [&](const auto& each) { return listed.count(idOf(each)) == 0; });
    return missing == ids.end() ? std::nullopt
                                : CheckResult(Mismatch{"missing", "instance " + idOf(*missing),
                                                       "only " + std::to_string(listed.size()) + " others"});
}

}  // namespace

CheckResult checkStatus(const Status& status, int code) {
    if (status.rc == code) {
        return std::nullopt;
    }
    return Mismatch{"status", code == CMPI_RC_OK ? "OK" : codeName(code), describe(status)};
}

CheckResult checkPath(const ObjectPath& created, const ObjectPath& expected) {
    const bool isSame = cim::sameName(created.className, expected.className) && created.keys.size() == 1 &&
                        cim::sameName(created.keys.front().name, expected.keys.front().name) &&
                        sameValue(created.keys.front().value, expected.keys.front().value);
    if (isSame) {
        return std::nullopt;
    }
    return Mismatch{"path", formatObjectPath(expected), formatObjectPath(created)};
}

CheckResult checkInstance(const LoadClass& known, const Instance& instance, const std::string& id,
                          const ExpectedState::Values& values) {
    const std::optional<std::string> inPath = known.idIn(instance.path.keys);
    const std::optional<std::string> inProperties = known.idIn(instance.properties);
    if (inPath.value_or(id) != id || inProperties.value_or(id) != id || (!inPath && !inProperties)) {
        return Mismatch{"value", known.key + " = " + inQuotes(id), formatObjectPath(instance.path)};
    }
    for (const auto& [name, value] : values) {
        const NamedValue* found = findNamed(instance.properties, name);
        if (found == nullptr || !sameValue(found->value, value)) {
            return Mismatch{"value", name + " = " + formatMof(value),
                            found == nullptr ? "none" : name + " = " + formatMof(found->value)};
        }
    }
    return std::nullopt;
}

CheckResult checkListing(const Expectation& expectation, const std::vector<Instance>& instances, bool hasProperties) {
    std::set<std::string> listed;
    for (const Instance& instance : instances) {
        const std::optional<std::string> id = idOf(expectation.known, instance);
        if (!id || id->empty()) {
            return Mismatch{"nameless", "instances with a key", formatObjectPath(instance.path)};
        }
        if (!listed.insert(*id).second) {
            return Mismatch{"duplicate", "instance " + *id + " once", "more than once"};
        }
        CheckResult mismatch = checkListed(expectation, *id, hasProperties ? &instance : nullptr);
        if (mismatch) {
            return mismatch;
        }
    }
    CheckResult mismatch = checkNoneMissing(expectation.others, listed, [](const std::string& id) { return id; });
    return mismatch ? mismatch : checkNoneMissing(expectation.state.instances(), listed, [](const auto& instance) {
        return instance.first;
    });
}

CheckResult checkAssociated(const std::vector<std::string>& now, const std::vector<std::string>& before) {
    const auto listed = [](const std::vector<std::string>& paths) {
        return paths.empty() ? "nothing"
                             : std::to_string(paths.size()) + ": " + paths.front() + (paths.size() > 1 ? "..." : "");
    };
    return now == before ? std::nullopt : CheckResult(Mismatch{"association", listed(before), listed(now)});
}

}  // namespace cimhost::lab
