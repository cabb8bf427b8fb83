#pragma once

#include <optional>
#include <string>
#include <vector>

#include "model/Value.h"
#include "schema/Schema.h"

namespace cimhost::lab {

/** The part of a class's declaration that a load uses. The schema must outlive it. */
struct LoadClass {
    ObjectPath path{};                          ///< of the class
    std::string key{};                          ///< the only key, a string
    std::vector<const Property*> modifiable{};  ///< writable properties whose values the load can generate

    ObjectPath instancePath(const std::string& id) const;

    /** The identifier among keys or properties; none if it is missing. */
    std::optional<std::string> idIn(const std::vector<NamedValue>& values) const;
};

/**
 * The class of a path.
 * @throws PlanError if it is not in the schema, or does not have exactly one key, a string
 */
LoadClass loadClass(const Schema& schema, const ObjectPath& path);

}  // namespace cimhost::lab
