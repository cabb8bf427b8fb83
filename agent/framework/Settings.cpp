#include "KO/Settings.h"

#include "KO/PlatformUtilities.h"
#include "KO/Product.h"
#include "KO/Strings.h"
#include "framework/AgentState.h"

// The parts of the configuration that the framework's interface returns.

namespace KO {

bool Settings::getFlag(const std::string& name, bool otherwise) {
    const auto agent = agentState();
    const auto found = agent->settings.flags.find(name);
    return found == agent->settings.flags.end() ? otherwise : found->second;
}

// The strings outlive the calls: the state is destroyed when the library is unloaded.
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
