#pragma once

#include "framework/AgentSettings.h"
#include "framework/NodeTree.h"

#include <memory>

namespace KO {

/** What the agent knows of itself and of the managed system: its configuration and what it found. */
struct AgentState {
    AgentSettings settings;
    NodeTree tree;
};

/**
 * The agent of this process. The first call reads the configuration and the managed system, and
 * reports in the log what is wrong with either; later calls cost next to nothing. Never null.
 */
std::shared_ptr<const AgentState> agentState();

}  // namespace KO
