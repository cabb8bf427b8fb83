#include "KO/PlatformUtilities.h"

#include "framework/AgentState.h"

namespace KO {

// The texts outlive the calls: the agent stays until the library goes.
const char* PlatformUtilities::getKelsaDirectory() {
    return agentState()->settings.installDirectory.c_str();
}
const char* PlatformUtilities::getKelsaDataDir() {
    return agentState()->settings.dataDirectory.c_str();
}

}  // namespace KO
