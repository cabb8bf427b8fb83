#pragma once

#include <string>

#include "Export.h"

namespace KO {

/** Flags of the agent's configuration for components other than the provider. */
class KO_EXPORT Settings {
public:
    /**
     * Reads a flag by the name of its table and key, for example "gate.refuse_lossy_values".
     *
     * The function is optional: it is declared weak, so callers must check that its address is not null.
     *
     * @param otherwise the result if the configuration does not set the flag
     */
    static bool getFlag(const std::string& name, bool otherwise) __attribute__((weak));
};

}  // namespace KO
