#pragma once

#include <string>

#include "lab/emulation/ManagerEmulation.h"
#include "lab/load/LoadClass.h"
#include "operations/ObjectManager.h"
#include "schema/MofReader.h"
#include "schema/Registration.h"
#include "support/Values.h"

/** The classes of the inventory. */
inline const cimhost::Schema& inventorySchema() {
    static const cimhost::Schema schema = [] {
        cimhost::Schema made;
        cimhost::MofReader(made).readFile(INVENTORY_DATA "/inventory.mof");
        return made;
    }();
    return schema;
}

inline cimhost::ObjectPath inventoryPath(const std::string& className) {
    return testsupport::objectPath("root/cimv2", className);
}

inline cimhost::lab::LoadClass inventoryClass(const std::string& className = "Inventory_Thing") {
    return cimhost::lab::loadClass(inventorySchema(), inventoryPath(className));
}

/** The options of a manager with the inventory. */
inline cimhost::ObjectManagerOptions inventoryOptions(cimhost::lab::Manager manager) {
    cimhost::ObjectManagerOptions options;
    options.libraries.searchPath = {INVENTORY_PROVIDERS};
    options.classInfo = cimhost::classInfos(inventorySchema());
    options.behaviour = cimhost::lab::emulationOf(manager);
    return options;
}

inline cimhost::ProviderRegistry inventoryRegistry() {
    return cimhost::ProviderRegistry(cimhost::readRegistrationFile(INVENTORY_DATA "/inventory.reg"));
}
