#include "KO/PlatformUtilities.h"

#include "framework/ThisAgent.h"

namespace KO {

// The texts outlive the calls: the agent stays until the library goes.
const char* PlatformUtilities::getKelsaDirectory() {
    return thisAgent()->settings.installDirectory.c_str();
}
const char* PlatformUtilities::getKelsaDataDir() {
    return thisAgent()->settings.dataDirectory.c_str();
}

}  // namespace KO
