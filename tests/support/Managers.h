#pragma once

#include <algorithm>
#include <ostream>
#include <string>

#include "broker/Profile.h"

namespace cimhost {

/** How test programs show a manager that is a parameter of a test. */
inline void PrintTo(Manager manager, std::ostream* out) {
    *out << profileOf(manager).name;
}

}  // namespace cimhost

namespace testsupport {

/** Every manager there is, for tests that hold for all of them. */
inline const cimhost::Manager everyManager[] = {cimhost::Manager::standard, cimhost::Manager::sfcb,
                                                cimhost::Manager::openPegasus, cimhost::Manager::openPegasusEmptyKey};

/** Names tests by the manager that is their parameter. */
struct ManagerName {
    template <class Info>
    std::string operator()(const Info& info) const {
        std::string name = cimhost::profileOf(info.param).name;
        std::replace(name.begin(), name.end(), '-', '_');
        return name;
    }
};

}  // namespace testsupport
