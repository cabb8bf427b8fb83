#pragma once

#include <cstddef>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "lab/load/Random.h"
#include "model/Value.h"

namespace cimhost::lab {

/** What somebody was told of the instances of a class that are its own. */
class ExpectedState {
public:
    using Values = std::map<std::string, Value>;  ///< by property; what is not there is not known

    /** @name What answers said */
    ///@{
    void created(const std::string& id, const Values& values);
    void modified(const std::string& id, const Values& values);
    void removed(const std::string& id);

    /** An answer was wrong, or none: whether the instance is there, and with what, is not known any more. */
    void doubt(const std::string& id);
    ///@}

    const std::map<std::string, Values>& instances() const { return known; }
    bool isDoubtful(const std::string& id) const { return doubtful.count(id) != 0; }
    const std::set<std::string>& doubted() const { return doubtful; }
    bool isEmpty() const { return ids.empty(); }

    /** One of the instances that are there. Not while it is empty. */
    std::string any(Random& random) const { return random.oneOf(ids); }

    /** Takes over what another state knows of other instances. */
    void add(const ExpectedState& other);

private:
    void forget(const std::string& id);

    std::map<std::string, Values> known;
    std::vector<std::string> ids;  ///< those of known, in no order
    std::set<std::string> doubtful;
};

}  // namespace cimhost::lab
