#pragma once

#include <string>

namespace contract {

/**
 * Other nodes in the agent's instrumentation tree than those of the test program: TOML text that stands in the
 * agent's configuration while the object lives. The agent reads its configuration when the provider is loaded, so
 * make it before.
 */
class AgentNodes {
public:
    explicit AgentNodes(const std::string& nodes);
    ~AgentNodes();
    AgentNodes(const AgentNodes&) = delete;
    AgentNodes& operator=(const AgentNodes&) = delete;

private:
    std::string before;  ///< the whole configuration
};

}  // namespace contract
