#include "Environment.h"

#include <stdexcept>

namespace bench {

namespace {

cimhost::Instance computerSystem(const std::string& name) {
    return {computerPath(name),
            {namedString("Name", name), namedString("ElementName", name), namedString("Vendor", names::vendor),
             namedString("Model", names::computerModel)}};
}

}  // namespace

cimhost::Response ComputerSystems::perform(cimhost::Request request) {
    if (request.operation != cimhost::Operation::enumerateInstances) {
        return cimhost::notSupported(request.operation);
    }
    if (request.path.className != names::computerClass) {
        return cimhost::Response::failed({CMPI_RC_ERR_INVALID_CLASS, "Only computers are served."});
    }
    std::vector<cimhost::Instance> instances;
    instances.push_back(computerSystem(names::computer));
    while (instances.size() < count) {
        instances.push_back(computerSystem("other" + std::to_string(instances.size())));
    }
    return cimhost::Response::ofInstances(std::move(instances));
}

Environment::Environment(AgentStays agentStays) {
    if (agentStays == AgentStays::yes) {
        agentLibraries.emplace();
    }
}

Interfaces Environment::loadBoth(std::size_t size, const ProviderEntry& entry) {
    unload();
    writeRows(directory.data() / LeaseRow::fileName, makeRows<LeaseRow>(size));
    writeRows(directory.data() / WarrantyRow::fileName, makeRows<WarrantyRow>(size));
    provider.emplace(entry, objectManager);
    return provider->interfaces();
}

void Environment::unload() {
    provider.reset();
    gate.reset();
    content.clear();
    std::vector<std::filesystem::path> unloaded{ProviderEntry::ofProvider().file, ProviderEntry::ofGate().file};
    if (!agentLibraries) {
        const auto agents = AgentLibraries::files();
        unloaded.insert(unloaded.end(), agents.begin(), agents.end());
    }
    for (const std::filesystem::path& file : unloaded) {
        if (isLoaded(file)) {
            throw std::runtime_error(file.string() + " was not unloaded");
        }
    }
    directory.removeRecords();
}

}  // namespace bench
