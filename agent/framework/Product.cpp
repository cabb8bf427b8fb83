#include "KO/Product.h"

#include "KO/Strings.h"
#include "framework/AgentState.h"

namespace KO {

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
