#include "lab/emulation/ManagerEmulation.h"

#include <algorithm>
#include <iterator>

#include "lab/emulation/Emulations.h"

namespace cimhost::lab {
namespace {

constexpr const char* managerNames[] = {"standard", "sfcb", "pegasus", "pegasus-empty-key"};

}  // namespace

const char* nameOf(Manager manager) {
    return managerNames[static_cast<std::size_t>(manager)];
}

std::optional<Manager> managerNamed(std::string_view name) {
    const auto* const found = std::find_if(std::begin(everyManager), std::end(everyManager),
                                           [&](Manager each) { return name == nameOf(each); });
    return found == std::end(everyManager) ? std::nullopt : std::optional(*found);
}

std::shared_ptr<const ManagerBehaviour> emulationOf(Manager manager) {
    switch (manager) {
        case Manager::sfcb:
            return sfcbEmulation();
        case Manager::openPegasus:
            return openPegasusEmulation(CreationKey::unreadable);
        case Manager::openPegasusEmptyKey:
            return openPegasusEmulation(CreationKey::empty);
        default:
            return std::make_shared<ManagerBehaviour>();
    }
}

void changeTables(Manager manager, FunctionTables& tables) {
    if (manager == Manager::sfcb) {
        changeToSfcbTables(tables);
    }
}

bool clientsSendPropertyLists(Manager manager) {
    return manager != Manager::sfcb;
}

}  // namespace cimhost::lab
