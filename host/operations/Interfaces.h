#pragma once

#include <cmpift.h>

#include <string>

#include "broker/Broker.h"
#include "operations/LoadedLibrary.h"

// The management interfaces of a provider: made by a factory, ended by cleanup.

namespace cimhost {

/** The kinds of management interfaces that this host calls. */
enum class InterfaceKind { instance, association };

/** "Instance" or "Association", as in the names of factories. */
const char* nameOf(InterfaceKind kind);

template <class Interface>
struct InterfaceTraits;

template <>
struct InterfaceTraits<CMPIInstanceMI> {
    static constexpr InterfaceKind kind = InterfaceKind::instance;
};

template <>
struct InterfaceTraits<CMPIAssociationMI> {
    static constexpr InterfaceKind kind = InterfaceKind::association;
};

/**
 * Calls the factory of a provider: <name>_Create_<kind>MI or, where the library has no such function,
 * _Generic_Create_<kind>MI; a manager that is played may choose otherwise where there are both. Objects that the
 * factory makes end with the call.
 * @param handle the broker as the provider is to see it: usually broker.handle()
 * @return never null, and with a function table; belongs to the provider
 * @throws LibraryError when there is no factory, or it fails, throws or answers nothing usable
 */
template <class Interface>
Interface* createInterface(const LoadedLibrary& library, const std::string& provider, Broker& broker,
                           const CMPIBroker* handle);

/**
 * Calls the cleanup function of an interface.
 * @param terminating whether the host ends; a provider may otherwise ask to stay loaded
 * @return the provider's status code; CMPI_RC_ERR_FAILED when it throws, CMPI_RC_OK when it has no such function
 */
template <class Interface>
int cleanUp(Interface* interface, Broker& broker, bool terminating);

}  // namespace cimhost
