#pragma once

#include <cmpift.h>
#include <cxxabi.h>

#include <exception>
#include <string>

#include "broker/Broker.h"
#include "broker/RequestScope.h"
#include "operations/LoadedLibrary.h"
#include "operations/ManagerBehaviour.h"

// Calls of a provider, and its management interfaces: created by a factory, ended by cleanup.

namespace cimhost {

/** How a call of a provider's function ended. */
struct ProviderCall {
    Status status{};
    bool hasMessage = false;  ///< whether the status carried a message, even an empty one
    bool threw = false;       ///< whether an exception left the provider; the status then describes it
};

/** The result of a call that an exception left. */
inline ProviderCall exceptionLeft(const std::string& what) {
    return {{CMPI_RC_ERR_FAILED, "An exception left the provider: " + what}, false, true};
}

/**
 * Calls a provider and catches its exceptions, so that the process survives them.
 * @param call returns the provider's CMPIStatus; a LibraryError that it throws is passed on
 */
template <class Call>
ProviderCall callProvider(Call&& call) {
    try {
        const CMPIStatus status = call();
        return {statusFrom(status), status.msg != nullptr, false};
    } catch (const abi::__forced_unwind&) {
        throw;  // the thread ends
    } catch (const LibraryError&) {
        throw;
    } catch (const std::exception& error) {
        return exceptionLeft(error.what());
    } catch (...) {
        return exceptionLeft("not derived from std::exception");
    }
}

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
 * Calls the factory of a provider: <name>_Create_<kind>MI or _Generic_Create_<kind>MI, whichever the library has.
 * Objects that the factory creates are released after the call.
 * @param choice the factory to call if the library has both
 * @return never null, and with a function table; belongs to the provider
 * @throws LibraryError when there is no factory, or it fails, throws or returns no usable interface
 */
template <class Interface>
Interface* createInterface(const LoadedLibrary& library, const std::string& provider, Broker& broker,
                           FactoryChoice choice);

/**
 * Calls the cleanup function of an interface.
 * @param terminating whether the host ends; a provider may otherwise ask to stay loaded
 * @return the provider's status code; CMPI_RC_ERR_FAILED when it throws, CMPI_RC_OK when it has no such function
 */
template <class Interface>
int cleanUp(Interface* interface, Broker& broker, bool terminating);

}  // namespace cimhost
