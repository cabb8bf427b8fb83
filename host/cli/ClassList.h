#pragma once

#include <string>
#include <vector>

#include "schema/Registration.h"
#include "schema/Schema.h"

namespace cimhost {

/** A class and who serves it. */
struct ListedClass {
    std::string name{};
    const Class* definition = nullptr;  ///< null for a class that is registered but not in the schema
    std::vector<ProviderRegistration> providers{};
};

/** All classes of the schema in its order, then those that are registered only, each with its providers. */
std::vector<ListedClass> listClasses(const Schema& schema, const std::vector<ProviderRegistration>& registrations);

}  // namespace cimhost
