#pragma once

#include "KO/PropertyFile.h"

#include <string>

namespace KO {

/** Grants KO::Utils access to the entries of a property file. */
class PropertyFileAccess {
public:
    /** The value of a key, empty if it is absent. @throws FrameworkException if the file is not open */
    static std::string read(const PropertyFile& file, const std::string& key);

    /** Sets the value of a key. @throws FrameworkException if the file is not open for writing */
    static void write(PropertyFile& file, const std::string& key, const std::string& value);
};

}  // namespace KO
