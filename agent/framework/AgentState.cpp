#include "framework/AgentState.h"

#include <mutex>

#include "KO/PlatformUtilities.h"
#include "KO/Product.h"
#include "KO/Settings.h"
#include "KO/Strings.h"
#include "RZLog/RZLogger.h"

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

// Threads may call agentState() while static objects are destroyed at exit. The mutex and the pointer remain valid,
// since they need no destruction.
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

// The parts of the configuration that the framework's interface returns.

bool Settings::getFlag(const std::string& name, bool otherwise) {
    const auto state = agentState();
    const auto found = state->settings.flags.find(name);
    return found == state->settings.flags.end() ? otherwise : found->second;
}

// The strings remain valid after the calls, since the state exists until the library is unloaded.
const char* PlatformUtilities::getKelsaDirectory() {
    return agentState()->settings.installDirectory.c_str();
}
const char* PlatformUtilities::getKelsaDataDir() {
    return agentState()->settings.dataDirectory.c_str();
}

std::wstring Product::getName() {
    return make_wstring(agentState()->settings.product.name);
}
std::wstring Product::getVersion() {
    return make_wstring(agentState()->settings.product.version);
}
std::wstring Product::getBuildNumber() {
    return make_wstring(agentState()->settings.product.buildNumber);
}
std::wstring Product::getIdentifyingNumber() {
    return make_wstring(agentState()->settings.product.identifyingNumber);
}
std::wstring Product::getVendor() {
    return make_wstring(agentState()->settings.product.vendor);
}

}  // namespace KO
