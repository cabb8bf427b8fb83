#pragma once

#include <cmpift.h>
#include <cxxabi.h>

#include <exception>
#include <string>

#include "broker/RequestScope.h"
#include "model/Status.h"
#include "operations/LibraryError.h"

namespace cimhost {

/** How a call of a provider's function ended. */
struct ProviderCall {
    Status status{};
    bool hasMessage = false;  ///< whether the status carried a message, even an empty one
    bool threw = false;       ///< whether an exception left the provider; the status then tells of it
};

/** What the host makes of an exception that left a provider. */
inline ProviderCall exceptionLeft(const std::string& what) {
    return {{CMPI_RC_ERR_FAILED, "An exception left the provider: " + what}, false, true};
}

/**
 * Calls a provider and catches what leaves it. An object manager that runs providers in its own process lives on.
 * @param call answers the provider's CMPIStatus; it may throw LibraryError of its own
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

}  // namespace cimhost
