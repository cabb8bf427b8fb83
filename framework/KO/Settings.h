#pragma once

#include "Export.h"

#include <string>

namespace KO {

/** Switches of the agent's configuration for those who work beside the provider. */
class KO_EXPORT Settings {
public:
    /**
     * A switch by the name of its table and its key, as "gate.refuse_lossy_values".
     *
     * An agent's framework may do without this operation: it is declared weak, and who uses it looks first whether
     * its address is null.
     *
     * @param otherwise the answer where the configuration does not say
     */
    static bool getFlag(const std::string& name, bool otherwise) __attribute__((weak));
};

}  // namespace KO
