#pragma once

#include <cmpift.h>
#include <cxxabi.h>

#include <exception>
#include <string>

#include "broker/Broker.h"
#include "broker/RequestScope.h"
#include "operations/LoadedLibrary.h"
#include "operations/ManagerBehaviour.h"

// Calls to providers: to the factories of management interfaces, and to the cleanup functions of the interfaces.

namespace cimhost {

/** The result of a call to a provider's function. */
struct ProviderCall {
    Status status{};
    bool hasMessage = false;  ///< whether the status had a message, even an empty one
    bool threw = false;       ///< whether the provider threw an exception; the status then describes it
};

/** The result of a call that threw an exception. */
inline ProviderCall callThatThrew(const std::string& what) {
    return {{CMPI_RC_ERR_FAILED, "The provider threw an exception: " + what}, false, true};
}

/**
 * Calls a provider and catches its exceptions.
 * @param call returns the provider's CMPIStatus; a LibraryError that it throws is rethrown
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
        return callThatThrew(error.what());
    } catch (...) {
        return callThatThrew("not derived from std::exception");
    }
}

/** The kinds of management interfaces that this host calls. */
enum class InterfaceKind { instance, association };

/**
 * Calls the factory of a provider, <name>_Create_<kind>MI or _Generic_Create_<kind>MI. CMPI objects that the factory
 * creates are released after the call.
 * @param choice the factory to call if the library has both
 * @return an interface with a function table; never null; owned by the provider
 * @throws LibraryError if there is no factory, or if it fails, throws, or returns no usable interface
 */
template <class Interface>
Interface* createInterface(const LoadedLibrary& library, const std::string& provider, Broker& broker,
                           FactoryChoice choice);

/**
 * Calls the cleanup function of an interface.
 * @param terminating whether the object manager is stopping
 * @return the provider's status code; CMPI_RC_ERR_FAILED if it throws, CMPI_RC_OK if it has no cleanup function
 */
template <class Interface>
int cleanUp(Interface* interface, Broker& broker, bool terminating);

}  // namespace cimhost
