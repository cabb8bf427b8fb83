#include "framework/AgentState.h"

#include <mutex>

#include "RZLog/RZLogger.h"
#include "framework/ComputerDiscovery.h"

namespace KO {

namespace {

void report(const Agent::Problems& problems) {
    constexpr int errorLevel = 3000;
    for (const std::string& problem : problems) {
        for (const auto write : {&RZLog::RZLogger::logLevelMessage, &RZLog::RZLogger::traceLevelMessage}) {
            write(__func__, "AgentState.cpp", __LINE__, "Ostrel.Agent", errorLevel, nullptr, 0, 0, problem);
        }
    }
}

std::shared_ptr<const AgentState> readAgentState() {
    Agent::Problems problems;
    auto agent = std::make_shared<AgentState>();
    agent->settings = readAgentSettings(Agent::Document::readDefault(), problems);
    if (agent->settings.discover) {
        agent->tree = discoverComputer(agent->settings.dmiRoot, hostName(), problems);
    }
    for (const Node& node : agent->settings.nodes) {
        agent->tree.put(node);
    }
    report(problems);
    return agent;
}

// Threads may call agentState() while static objects are destroyed at exit. They use only the mutex and the pointer
// then, which need no destruction.
std::mutex agentMutex;
std::shared_ptr<const AgentState>* agent = nullptr;

struct AgentOwner {
    ~AgentOwner() { forgetAgentState(); }
} agentOwner;

}  // namespace

std::shared_ptr<const AgentState> agentState() {
    const std::lock_guard<std::mutex> lock(agentMutex);
    if (agent == nullptr) {
        agent = new std::shared_ptr<const AgentState>(readAgentState());
    }
    return *agent;
}

void forgetAgentState() {
    const std::lock_guard<std::mutex> lock(agentMutex);
    delete agent;
    agent = nullptr;
}

}  // namespace KO
