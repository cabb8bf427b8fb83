#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "AgentDirectory.h"
#include "ProviderLibrary.h"
#include "RecordFile.h"
#include "Rows.h"
#include "broker/Broker.h"

namespace bench {

/** Handles the provider's requests to the broker, which may only enumerate the computers. */
class ComputerSystems : public cimhost::UpCalls {
public:
    /** Number of computers; the first is the one that the agent manages. */
    std::size_t count = 1;

    cimhost::Response perform(cimhost::Request request) override;
};

/** Whether the agent's libraries stay loaded when the provider is unloaded. */
enum class AgentStays { yes, no };

/** The environment of the benchmarks: an agent, a broker, and the provider, which is loaded on demand. */
class Environment {
public:
    explicit Environment(AgentStays agentStays = AgentStays::yes);

    cimhost::Broker& broker() { return objectManager; }
    ComputerSystems& computers() { return upCalls; }
    const AgentDirectory& agent() const { return directory; }

    /** Loads the provider with these records and none of the other class. */
    template <class Row>
    Interfaces load(const std::vector<Row>& rows) {
        unload();
        writeRows(directory.data() / Row::fileName, rows);
        provider.emplace(ProviderEntry::ofProvider(), objectManager);
        return provider->interfaces();
    }

    /** Loads the provider with this number of records, unless it is already loaded with them. */
    template <class Row>
    Interfaces loaded(std::size_t size) {
        const std::string wanted = Row::fileName + std::to_string(size);
        if (!provider || content != wanted) {
            load(makeRows<Row>(size));
            content = wanted;
        }
        return provider->interfaces();
    }

    /** Loads two copies of the provider with the same records: the first alone, the second behind the gate. */
    template <class Row>
    std::pair<Interfaces, Interfaces> loadedTwice(std::size_t size) {
        const std::string wanted = std::string("twice ") + Row::fileName + std::to_string(size);
        if (!gate || content != wanted) {
            unload();
            writeRows(directory.data() / Row::fileName, makeRows<Row>(size));
            gate.emplace(ProviderEntry::ofGate(), objectManager);
            provider.emplace(ProviderEntry::ofCopy(directory.data()), objectManager);
            content = wanted;
        }
        return {provider->interfaces(), gate->interfaces()};
    }

    /** Loads the provider, alone or behind the gate, with this number of records of each class. */
    Interfaces loadBoth(std::size_t size, const ProviderEntry& entry);

    /**
     * Unloads the provider and the libraries that it loaded, and removes the records.
     * @throws std::runtime_error if a library that must be unloaded is still loaded
     */
    void unload();

private:
    AgentDirectory directory{};
    std::optional<AgentLibraries> agentLibraries{};
    ComputerSystems upCalls{};
    cimhost::Broker objectManager{{{}, &upCalls, {}, nullptr}};
    std::optional<ProviderLibrary> provider{};
    std::optional<ProviderLibrary> gate{};
    std::string content{};  ///< describes the records; empty if a request may have changed them
};

}  // namespace bench
