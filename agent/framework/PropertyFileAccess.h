#pragma once

#include "KO/PropertyFile.h"

#include <string>

namespace KO {

/** The way of KO::Utils to the entries of a property file. */
class PropertyFileAccess {
public:
    /** The text under a key, empty when it is absent. @throws FrameworkException if the file is not open */
    static std::string read(const PropertyFile& file, const std::string& key);

    /** Sets the text under a key. @throws FrameworkException if the file is not open for writing */
    static void write(PropertyFile& file, const std::string& key, const std::string& value);
};

}  // namespace KO
