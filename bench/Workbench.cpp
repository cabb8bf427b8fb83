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

cimhost::Response ComputerSystems::perform(cimhost::Request request) {
    if (request.operation != cimhost::Operation::enumerateInstances) {
        return cimhost::notSupported(request.operation);
    }
    if (request.path.className != "VELKO_ComputerSystem") {
        return cimhost::Response::failed({CMPI_RC_ERR_INVALID_CLASS, "only computers are served"});
    }
    std::vector<cimhost::Instance> instances;
    instances.push_back(computerSystem(names::computer));
    while (instances.size() < count) {
        instances.push_back(computerSystem("other" + std::to_string(instances.size())));
    }
    return cimhost::Response::ofInstances(std::move(instances));
}

Workbench::Workbench(AgentStays agentStays) {
    if (agentStays == AgentStays::yes) {
        agentLibraries.emplace();
    }
}

Interfaces Workbench::loadBoth(std::size_t size, const Entrance& entrance) {
    unload();
    writeRows(directory.data() / LeaseRow::fileName, makeRows<LeaseRow>(size));
    writeRows(directory.data() / WarrantyRow::fileName, makeRows<WarrantyRow>(size));
    provider.emplace(entrance, objectManager.handle());
    return provider->interfaces();
}

void Workbench::unload() {
    provider.reset();
    gate.reset();
    content.clear();
    std::vector<std::filesystem::path> gone{Entrance::provided().file, Entrance::gate().file};
    if (!agentLibraries) {
        const auto agents = AgentLibraries::files();
        gone.insert(gone.end(), agents.begin(), agents.end());
    }
    for (const std::filesystem::path& file : gone) {
        if (SharedLibrary::isLoaded(file)) {
            throw std::runtime_error(file.string() + " stays in the process");
        }
    }
    directory.removeRecords();
}

}  // namespace bench
