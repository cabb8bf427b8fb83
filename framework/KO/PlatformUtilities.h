#pragma once

#include "Export.h"

namespace KO {

/**
 * Where the agent lives. Each text ends with a path separator, so that a file name can be appended
 * directly, and lives as long as the framework library. Neither directory need exist.
 */
class KO_EXPORT PlatformUtilities {
public:
    static const char* getKelsaDirectory();  ///< installation directory
    static const char* getKelsaDataDir();    ///< data directory, where the agent keeps its files
};

}  // namespace KO
