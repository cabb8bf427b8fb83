#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "operations/Interfaces.h"
#include "schema/Registration.h"

namespace cimhost {

/** Where a provider is: its library and its name there. */
struct ProviderAddress {
    std::string location{};  ///< see findLibrary()
    std::string provider{};  ///< prefix of its factories
    std::string forClass{};  ///< the class that it is started for; empty: for all that it serves
};

/** A class that a provider serves in a namespace. */
struct ServedClass {
    std::string nameSpace{};
    std::string className{};  ///< as registered
    InterfaceKind kind = InterfaceKind::instance;
    ProviderAddress address{};
};

/**
 * Which provider serves which class. Names of classes and namespaces ignore letter case. Fill it, then share it for
 * reading; pointers to entries stay good until the next add().
 */
class ProviderRegistry {
public:
    ProviderRegistry() = default;
    explicit ProviderRegistry(const std::vector<ProviderRegistration>& registrations);

    /** Adds a registration; it takes the place of an earlier one for the same namespace, class and kind. */
    void add(const ProviderRegistration& registration);

    /** Whether any registration names the namespace. */
    bool knowsNameSpace(std::string_view nameSpace) const;

    /** The provider of that kind for a class in a namespace; null when there is none. */
    const ServedClass* find(std::string_view nameSpace, std::string_view className, InterfaceKind kind) const;

    /** All association classes of a namespace, in the order in which they were added. */
    std::vector<const ServedClass*> associations(std::string_view nameSpace) const;

private:
    void add(ServedClass entry);

    std::vector<ServedClass> entries;
};

}  // namespace cimhost
