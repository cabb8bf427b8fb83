#pragma once

#include <string>

#include "lab/emulation/ManagerEmulation.h"
#include "lab/load/LoadClass.h"
#include "operations/ObjectManager.h"
#include "schema/MofReader.h"
#include "schema/Registration.h"
#include "support/Values.h"

/** The depot's classes. */
inline const cimhost::Schema& depotSchema() {
    static const cimhost::Schema schema = [] {
        cimhost::Schema made;
        cimhost::MofReader(made).readFile(DEPOT_DATA "/depot.mof");
        return made;
    }();
    return schema;
}

inline cimhost::ObjectPath depotPath(const std::string& className) {
    return testsupport::objectPath("root/cimv2", className);
}

inline cimhost::lab::LoadClass depotClass(const std::string& className = "Depot_Thing") {
    return cimhost::lab::loadClass(depotSchema(), depotPath(className));
}

/** What a manager that serves the depot works with. */
inline cimhost::ObjectManagerOptions depotOptions(cimhost::lab::Manager manager) {
    cimhost::ObjectManagerOptions options;
    options.libraries.searchPath = {DEPOT_PROVIDERS};
    options.classInfo = cimhost::classInfos(depotSchema());
    options.behaviour = cimhost::lab::emulationOf(manager);
    return options;
}

inline cimhost::ProviderRegistry depotRegistry() {
    return cimhost::ProviderRegistry(cimhost::readRegistrationFile(DEPOT_DATA "/depot.reg"));
}
