#pragma once

#include <algorithm>
#include <memory>
#include <optional>
#include <ostream>
#include <string>
#include <string_view>

#include "operations/ManagerBehaviour.h"

namespace cimhost::lab {

/** The object managers that tests can run a provider under. */
enum class Manager {
    standard,             ///< the host itself, which behaves as the standard says
    sfcb,                 ///< SFCB 1.3, as observed
    openPegasus,          ///< OpenPegasus, as observed
    openPegasusEmptyKey,  ///< the same, with an empty instead of an unreadable key in the path of a new instance
};

inline constexpr Manager everyManager[] = {Manager::standard, Manager::sfcb, Manager::openPegasus,
                                           Manager::openPegasusEmptyKey};

/** The name of the manager on command lines, such as "sfcb". */
const char* nameOf(Manager manager);

/** The manager with a name; none if the name is unknown. */
std::optional<Manager> managerNamed(std::string_view name);

/** The manager's differences from the standard; for Manager::standard, the standard behaviour. */
std::shared_ptr<const ManagerBehaviour> emulationOf(Manager manager);

/** Sets the versions of the manager's tables, and removes the functions that the manager does not have. */
void changeTables(Manager manager, FunctionTables& tables);

/** Whether clients of the manager send a list of the properties to modify. */
bool clientsSendPropertyLists(Manager manager);

/** Prints a manager that is the parameter of a test. */
inline void PrintTo(Manager manager, std::ostream* out) {
    *out << nameOf(manager);
}

/** Names tests after the manager that is their parameter. */
struct ManagerName {
    template <class Info>
    std::string operator()(const Info& info) const {
        std::string name = nameOf(info.param);
        std::replace(name.begin(), name.end(), '-', '_');
        return name;
    }
};

}  // namespace cimhost::lab
