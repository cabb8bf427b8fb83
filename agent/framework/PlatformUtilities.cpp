#include "KO/PlatformUtilities.h"

#include "framework/AgentState.h"

namespace KO {

// The strings outlive the calls: the state is destroyed when the library is unloaded.
const char* PlatformUtilities::getKelsaDirectory() {
    return agentState()->settings.installDirectory.c_str();
}
const char* PlatformUtilities::getKelsaDataDir() {
    return agentState()->settings.dataDirectory.c_str();
}

}  // namespace KO
