#pragma once

#include "Export.h"

namespace KO {

/**
 * The agent's directories. Each string ends with a path separator, so that a file name can be appended, and is valid as
 * long as the framework library is loaded. The directories need not exist.
 */
class KO_EXPORT PlatformUtilities {
public:
    static const char* getKelsaDirectory();  ///< installation directory
    static const char* getKelsaDataDir();    ///< data directory with the agent's files
};

}  // namespace KO
