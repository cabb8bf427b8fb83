#pragma once

#include "AgentDirectory.h"
#include "ProviderLibrary.h"
#include "RecordFile.h"
#include "Rows.h"
#include "broker/Broker.h"

#include <cstddef>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace bench {

/** Responds to requests of the provider with the instances of the managed computers. */
class ComputerSystems : public cimhost::UpCalls {
public:
    /** Number of computers; the first is the one that the agent manages. */
    std::size_t count = 1;

    cimhost::Response perform(cimhost::Request request) override;
};

/** Whether the agent's libraries stay in the process when the provider goes. */
enum class AgentStays { yes, no };

/** Where all benchmarks are run: an agent, the object manager's broker and, loaded on demand, the provider. */
class Workbench {
public:
    explicit Workbench(AgentStays agentStays = AgentStays::yes);

    cimhost::Broker& broker() { return objectManager; }
    ComputerSystems& computers() { return upCalls; }
    const AgentDirectory& agent() const { return directory; }

    /** The provider, freshly loaded with these records and none of the other class. */
    template <class Row>
    Interfaces load(const std::vector<Row>& rows) {
        unload();
        writeRows(directory.data() / Row::fileName, rows);
        provider.emplace(Entrance::provided(), objectManager.handle());
        return provider->interfaces();
    }

    /** The provider with a table of that many records: still loaded since the last such call, or loaded again. */
    template <class Row>
    Interfaces loaded(std::size_t size) {
        const std::string wanted = Row::fileName + std::to_string(size);
        if (!provider || content != wanted) {
            load(makeRows<Row>(size));
            content = wanted;
        }
        return provider->interfaces();
    }

    /** The same table twice, in two copies of the provider: the first alone, the second behind the gate. */
    template <class Row>
    std::pair<Interfaces, Interfaces> loadedTwice(std::size_t size) {
        const std::string wanted = std::string("twice ") + Row::fileName + std::to_string(size);
        if (!gate || content != wanted) {
            unload();
            writeRows(directory.data() / Row::fileName, makeRows<Row>(size));
            gate.emplace(Entrance::gate(), objectManager.handle());  // first: what it needs is found by its name
            provider.emplace(Entrance::copyOf(directory.data()), objectManager.handle());
            content = wanted;
        }
        return {provider->interfaces(), gate->interfaces()};
    }

    /** The provider, or the gate with the provider behind it, freshly loaded with so many records of each class. */
    Interfaces loadBoth(std::size_t size, const Entrance& entrance);

    /**
     * Takes the provider out of the process, and with it what it has brought there, and its records away.
     * @throws std::runtime_error when a library stays that should not
     */
    void unload();

private:
    AgentDirectory directory{};
    std::optional<AgentLibraries> agentLibraries{};
    ComputerSystems upCalls{};
    cimhost::Broker objectManager{{{}, &upCalls, {}, nullptr}};
    std::optional<ProviderLibrary> provider{};
    std::optional<ProviderLibrary> gate{};
    std::string content{};  ///< what loaded() has loaded; empty when a request may have changed it
};

}  // namespace bench
