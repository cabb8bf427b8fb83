#include "KO/Settings.h"

#include "framework/AgentState.h"

namespace KO {

bool Settings::getFlag(const std::string& name, bool otherwise) {
    const auto agent = agentState();
    const auto found = agent->settings.flags.find(name);
    return found == agent->settings.flags.end() ? otherwise : found->second;
}

}  // namespace KO
