#include "Workbench.h"

#include <stdexcept>

namespace bench {

namespace {

cimhost::Instance computerSystem(const std::string& name) {
    cimhost::Instance computer;
    computer.path = classPath("VELKO_ComputerSystem");
    computer.path.keys.push_back(textValue("Name", name));
    computer.properties.push_back(textValue("Name", name));
    computer.properties.push_back(textValue("ElementName", name));
    computer.properties.push_back(textValue("Vendor", names::vendor));
    computer.properties.push_back(textValue("Model", names::computerModel));
    return computer;
}

}  // namespace

cimhost::Answer<std::vector<cimhost::Instance>> ComputerSystems::enumerateInstances(const cimhost::ContextEntries&,
                                                                                    const cimhost::ObjectPath& path,
                                                                                    const cimhost::PropertyList&) {
    if (path.className != "VELKO_ComputerSystem") {
        return {{CMPI_RC_ERR_INVALID_CLASS, "only computers are served"}, {}};
    }
    std::vector<cimhost::Instance> instances;
    instances.push_back(computerSystem(names::computer));
    while (instances.size() < count) {
        instances.push_back(computerSystem("other" + std::to_string(instances.size())));
    }
    return {{}, std::move(instances)};
}

void Workbench::unload() {
    provider.reset();
    gate.reset();
    content.clear();
    if (SharedLibrary::isLoaded(Entrance::provided().file)) {
        throw std::runtime_error("the provider library stays in the process");
    }
    directory.removeRecords();
}

}  // namespace bench
