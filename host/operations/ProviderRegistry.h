#pragma once

#include <string>
#include <string_view>
#include <tuple>
#include <vector>

#include "operations/Interfaces.h"
#include "schema/Registration.h"

namespace cimhost {

/** The library of a provider, and the provider's name in it. */
struct ProviderAddress {
    std::string location{};  ///< see findLibrary()
    std::string provider{};  ///< prefix of its factories
    std::string forClass{};  ///< the class that the provider is created for; empty: all its classes

    bool operator<(const ProviderAddress& other) const {
        return std::tie(location, provider, forClass) < std::tie(other.location, other.provider, other.forClass);
    }
};

/** A class that a provider serves in a namespace. */
struct ServedClass {
    std::string nameSpace{};
    std::string className{};  ///< as registered
    InterfaceKind kind = InterfaceKind::instance;
    ProviderAddress address{};
};

/**
 * The provider of each class. Names of classes and namespaces are case-insensitive. Pointers to entries are valid until
 * the next add(). Concurrent reading is safe.
 */
class ProviderRegistry {
public:
    ProviderRegistry() = default;
    explicit ProviderRegistry(const std::vector<ProviderRegistration>& registrations);

    /** Adds a registration. Replaces entries for the same namespace, class and kind. */
    void add(const ProviderRegistration& registration);

    /** All namespaces that registrations name, each once, in the order of the registrations. */
    std::vector<std::string> nameSpaces() const;

    /** Whether a class is registered for the namespace. */
    bool knowsNameSpace(std::string_view nameSpace) const;

    /** The provider of that kind for a class in a namespace; null if there is none. */
    const ServedClass* find(std::string_view nameSpace, std::string_view className, InterfaceKind kind) const;

    /** All association classes of a namespace, in the order in which they were added. */
    std::vector<const ServedClass*> associations(std::string_view nameSpace) const;

private:
    void add(ServedClass entry);

    std::vector<ServedClass> entries;
};

}  // namespace cimhost
