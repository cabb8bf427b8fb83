#pragma once

#include <functional>
#include <string>

namespace agentEnvironment {

/** Replaces the agent's configuration while it exists. The agent reads it when the framework is loaded. */
class AgentConfiguration {
public:
    AgentConfiguration(const AgentConfiguration&) = delete;
    AgentConfiguration& operator=(const AgentConfiguration&) = delete;

protected:
    /** @param change converts the complete configuration, a TOML document */
    explicit AgentConfiguration(const std::function<std::string(const std::string&)>& change);
    ~AgentConfiguration();

private:
    std::string before;
};

/** Replaces the nodes of the agent's instrumentation tree by a TOML fragment while it exists. */
class AgentNodes : public AgentConfiguration {
public:
    explicit AgentNodes(const std::string& nodes);
};

/** Replaces the version of the agent's product while it exists. */
class AgentVersion : public AgentConfiguration {
public:
    explicit AgentVersion(const std::string& version);
};

}  // namespace agentEnvironment
