#pragma once

#include <optional>
#include <string>
#include <vector>

#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost::lab {

/** What a load needs to know of a class; all of it comes from the schema, which must outlive it. */
struct LoadClass {
    ObjectPath path{};                          ///< of the class
    std::string key{};                          ///< the one key, a string
    std::vector<const Property*> modifiable{};  ///< writable properties for which there are values

    ObjectPath instancePath(const std::string& id) const;

    /** The identifier in the keys of a path or the properties of an instance; none without it. */
    std::optional<std::string> idIn(const std::vector<NamedValue>& values) const;
};

/**
 * The class of that path, for a load.
 * PlanError when it is not in the schema, or has other keys than one string.
 */
LoadClass loadClass(const Schema& schema, const ObjectPath& path);

}  // namespace cimhost::lab
