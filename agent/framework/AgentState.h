#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "configuration/Document.h"
#include "framework/NodeTree.h"

namespace KO {

/** The framework's part of the configuration: every table except [log]. */
struct AgentSettings {
    std::string installDirectory;  ///< ends with a separator, as does dataDirectory
    std::string dataDirectory;

    struct {
        std::string name;
        std::string version;
        std::string buildNumber;
        std::string identifyingNumber;
        std::string vendor;
    } product;

    std::string dmiRoot;      ///< directory of the kernel's DMI files
    bool discover;            ///< whether the computer is discovered
    std::vector<Node> nodes;  ///< nodes to add, or to replace discovered ones

    std::map<std::string, bool> flags;  ///< the configured flags, by table and key: "gate.refuse_lossy_values"
};

/** Reads the settings. A setting whose value is absent or invalid has its default. */
AgentSettings readAgentSettings(const Agent::Document& document, Agent::Problems& problems);

/** The agent's configuration, and the nodes of the managed system. */
struct AgentState {
    AgentSettings settings;
    NodeTree tree;
};

/**
 * The state of this process's agent. The first call reads the configuration, discovers the managed system, and logs the
 * problems of both. Never null.
 */
std::shared_ptr<const AgentState> agentState();

/** Drops the state, so that the next call to agentState() reads it again. For tests with several configurations. */
void forgetAgentState();

}  // namespace KO
