#include "KO/Product.h"

#include "KO/Strings.h"
#include "framework/ThisAgent.h"

namespace KO {

std::wstring Product::getName() {
    return make_wstring(thisAgent()->settings.product.name);
}
std::wstring Product::getVersion() {
    return make_wstring(thisAgent()->settings.product.version);
}
std::wstring Product::getBuildNumber() {
    return make_wstring(thisAgent()->settings.product.buildNumber);
}
std::wstring Product::getIdentifyingNumber() {
    return make_wstring(thisAgent()->settings.product.identifyingNumber);
}
std::wstring Product::getVendor() {
    return make_wstring(thisAgent()->settings.product.vendor);
}

}  // namespace KO
