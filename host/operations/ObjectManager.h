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

/** What an object manager is made with. */
struct ObjectManagerOptions {
    LibraryOptions libraries{};
    ClassInfoLookup classInfo{};                  ///< none: no class is known; see BrokerOptions
    std::function<void(const LogRecord&)> log{};  ///< none: what providers log is dropped
    ContextEntries context{};                     ///< entries that every request's context has, such as CMPIPrincipal
    std::shared_ptr<const ManagerBehaviour> behaviour{};  ///< null: the standard behaviour
};

/**
 * The embedded object manager: sends each request to the provider that is registered for it, and maps its response to
 * what the client receives. Clients and providers (UpCalls) use the same function. Requests run on the calling thread
 * unless the behaviour uses another, and may run concurrently. No lock is held while a provider runs, except by its
 * factory.
 *
 * If a provider's process would have ended (ManagerBehaviour::crashReason), the provider's library is unloaded without
 * cleanup as soon as no request runs: its state in memory is lost.
 *
 * The context of a request is that of the request, completed by the options' entries and by CMPIInvocationFlags (0),
 * CMPIInitNameSpace (the request's namespace) and CMPIPrincipal (ManagerBehaviour::principal).
 */
class ObjectManager : public UpCalls {
public:
    ObjectManager(ObjectManagerOptions itsOptions, ProviderRegistry itsRegistry);
    ~ObjectManager() override;

    /**
     * Performs a request. A provider receives the instance of a creation with exactly its properties, preceded by those
     * keys of the path that are not among them, and the instance of a modification with exactly its properties.
     *
     * Association operations call the provider of the association class (the result class, for references) and those of
     * its registered subclasses or, without a class, those of all registered association classes; each receives the
     * class that it is called for.
     *
     * @return the results, or a status that is not OK, with a message: that of mapResponses(), or
     * CMPI_RC_ERR_INVALID_NAMESPACE and CMPI_RC_ERR_INVALID_CLASS when no provider is registered;
     * CMPI_RC_ERR_NOT_SUPPORTED for methods and single properties
     * @throws LibraryError when a provider cannot be loaded, unless the behaviour has a status for it
     */
    Response perform(Request request) override;

    /**
     * Cleans up all providers and unloads libraries that do not ask to stay, as after a time without requests. They are
     * loaded again when they are needed. Not while a request runs.
     */
    void idle() { pool.idle(); }

    /**
     * Cleans up all providers for good, without waiting for requests that run. Later requests, up-calls too, fail with
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

    /** The interface of a class's provider; starts the other interface, too, where the policy says so. */
    template <class Interface>
    Interface* started(const ServedClass& served);

    /** The response of the class's provider. */
    template <class Interface>
    ProviderResponse call(const ServedClass& served, const Request& request);

    std::shared_ptr<const ManagerBehaviour> ownedBehaviour;
    const ManagerBehaviour& behaviour;
    ProviderPolicy policy;
    ContextEntries baseContext;
    ProviderRegistry providers;
    Broker itsBroker;
    ProviderPool pool;
};

}  // namespace cimhost
