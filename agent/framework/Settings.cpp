#include "KO/Settings.h"

#include "framework/ThisAgent.h"

namespace KO {

bool Settings::getFlag(const std::string& name, bool otherwise) {
    const auto agent = thisAgent();
    const auto found = agent->settings.flags.find(name);
    return found == agent->settings.flags.end() ? otherwise : found->second;
}

}  // namespace KO
