#pragma once

#include "framework/AgentSettings.h"
#include "framework/NodeTree.h"

#include <memory>

namespace KO {

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

/** Drops the state, so that the next call of agentState() reads it again. For tests with several configurations. */
void forgetAgentState();

}  // namespace KO
