#pragma once

#include <string>

#include "Export.h"

namespace KO {

/** The product record of the management agent, as configured. No value is empty. */
class KO_EXPORT Product {
public:
    static std::wstring getName();               ///< product name
    static std::wstring getVersion();            ///< version, such as "2.0.0"
    static std::wstring getBuildNumber();        ///< build number
    static std::wstring getIdentifyingNumber();  ///< unique identifier of the installation
    static std::wstring getVendor();             ///< manufacturer of the agent
};

}  // namespace KO
