#pragma once

#include <cstddef>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "lab/load/Random.h"
#include "model/Value.h"

namespace cimhost::lab {

/** The expected instances of a class, according to the responses to one client or to all. */
class ExpectedState {
public:
    using Values = std::map<std::string, Value>;  ///< by property; the values of other properties are unknown

    /** @name Changes according to responses */
    ///@{
    void created(const std::string& id, const Values& values);
    void modified(const std::string& id, const Values& values);
    void removed(const std::string& id);

    /** After a wrong response: the existence and the values of the instance are unknown. */
    void doubt(const std::string& id);
    ///@}

    const std::map<std::string, Values>& instances() const { return known; }
    bool isDoubtful(const std::string& id) const { return doubtful.count(id) != 0; }
    const std::set<std::string>& doubted() const { return doubtful; }
    bool isEmpty() const { return ids.empty(); }

    /** Returns a random instance. The state must not be empty. */
    std::string any(Random& random) const { return random.oneOf(ids); }

    /** Adds the instances of another state. */
    void add(const ExpectedState& other);

private:
    void forget(const std::string& id);

    std::map<std::string, Values> known;
    std::vector<std::string> ids;  ///< those of known, in no order
    std::set<std::string> doubtful;
};

}  // namespace cimhost::lab
