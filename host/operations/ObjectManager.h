#pragma once

#include <functional>
#include <memory>
#include <vector>

#include "broker/Broker.h"
#include "operations/LoadedLibrary.h"
#include "operations/ManagerBehaviour.h"
#include "operations/ProviderPool.h"
#include "operations/ProviderRegistry.h"

namespace cimhost {

/** The parameters of an object manager. */
struct ObjectManagerOptions {
    LibraryOptions libraries{};
    ClassInfoLookup classInfo{};                          ///< none: all classes are unknown; see BrokerOptions
    std::function<void(const LogRecord&)> log{};          ///< none: log records are discarded
    ContextEntries context{};                             ///< entries of every request's context, such as CMPIPrincipal
    std::shared_ptr<const ManagerBehaviour> behaviour{};  ///< null: the standard behaviour
    bool keepsEvents = true;  ///< whether Response::providers contains the events; this copies the results
};

/**
 * The embedded object manager. It calls the provider that is registered for a request, and maps the provider's response
 * to the client's. Clients and providers (UpCalls) call the same function, perform(). A request runs on the calling
 * thread unless the behaviour uses another. Requests can run concurrently: a lock is held while a factory runs, but not
 * while a provider performs a request.
 *
 * If a response would have crashed the provider's process (ManagerBehaviour::crashReason), the library is unloaded
 * without cleanup as soon as no request is running. The provider then loses its state in memory.
 *
 * A provider receives the context entries of the request, those of the options, and CMPIInvocationFlags (0),
 * CMPIInitNameSpace (the request's namespace) and CMPIPrincipal (ManagerBehaviour::principal). If several of these have
 * the same name, the first applies.
 */
class ObjectManager : public UpCalls {
public:
    ObjectManager(ObjectManagerOptions itsOptions, ProviderRegistry itsRegistry);

    /**
     * Performs a request. The provider receives the instance of a creation or modification with exactly the properties
     * of the request. In a creation, the keys of the path that are not among the properties precede them.
     *
     * An association operation calls the providers of the association class (for references, the result class) and of
     * its registered subclasses; without a class, those of all registered association classes. Each call passes the
     * class that it is made for, unless the behaviour omits the class.
     *
     * @return the results, or a message and a status other than OK: the status from mapResponses();
     * CMPI_RC_ERR_INVALID_NAMESPACE or CMPI_RC_ERR_INVALID_CLASS if no provider is registered;
     * CMPI_RC_ERR_NOT_SUPPORTED for methods and single properties; CMPI_RC_ERR_FAILED after stop()
     * @throws LibraryError if a provider cannot be started, unless the behaviour has a status for the error
     */
    Response perform(Request request) override;

    /**
     * Cleans up all providers, and unloads the libraries whose providers do not ask to stay, as an idle object manager
     * does. The next request loads them again. Must not be called while a request is running.
     */
    void idle() { pool.idle(); }

    /**
     * Cleans up all providers without waiting for running requests. Later requests and up-calls fail with
     * CMPI_RC_ERR_FAILED.
     */
    void stop() { pool.stop(); }

    const ProviderRegistry& registry() const { return providers; }
    Broker& broker() { return itsBroker; }

private:
    Response performForInstance(Request request);
    Response performForAssociation(Request request);
    std::vector<const ServedClass*> associationsFor(const std::string& nameSpace,
                                                    const std::optional<std::string>& className) const;
    void completeContext(Request& request) const;
    ProviderAddress addressOf(const ServedClass& served) const;

    /** Returns the interface of a class's provider. Also creates the other interface if the policy requires it. */
    template <class Interface>
    Interface* started(const ServedClass& served);

    /** Calls the provider of a class. */
    template <class Interface>
    ProviderResponse call(const ServedClass& served, const Request& request);

    std::shared_ptr<const ManagerBehaviour> ownedBehaviour;
    const ManagerBehaviour& behaviour;
    ProviderPolicy policy;
    bool keepsEvents;
    ContextEntries baseContext;
    ProviderRegistry providers;
    Broker itsBroker;
    ProviderPool pool;
};

}  // namespace cimhost
