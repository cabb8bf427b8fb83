#pragma once

#include <functional>
#include <string>

namespace contract {

/** Another configuration of the agent than that of the test program, while the object lives. */
class AgentConfiguration {
public:
    AgentConfiguration(const AgentConfiguration&) = delete;
    AgentConfiguration& operator=(const AgentConfiguration&) = delete;

protected:
    /** @param change of the whole configuration, TOML text */
    explicit AgentConfiguration(const std::function<std::string(const std::string&)>& change);
    ~AgentConfiguration();

private:
    std::string before;
};

/**
 * Other nodes in the agent's instrumentation tree than those of the test program: TOML text that stands in the
 * agent's configuration while the object lives. The agent reads its configuration when the provider is loaded, so
 * make it before.
 */
class AgentNodes : public AgentConfiguration {
public:
    explicit AgentNodes(const std::string& nodes);
};

/** Another version of the agent's product, in the same way. */
class AgentVersion : public AgentConfiguration {
public:
    explicit AgentVersion(const std::string& version);
};

}  // namespace contract
