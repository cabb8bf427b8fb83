#pragma once

#include "Export.h"

#include <string>

namespace KO {

/** The product record of the management agent. All texts are as configured; none is empty. */
class KO_EXPORT Product {
public:
    static std::wstring getName();               ///< product name
    static std::wstring getVersion();            ///< version, such as "2.0.0"
    static std::wstring getBuildNumber();        ///< build number
    static std::wstring getIdentifyingNumber();  ///< what tells this installation from others
    static std::wstring getVendor();             ///< who makes the agent
};

}  // namespace KO
