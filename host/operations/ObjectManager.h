#pragma once

#include <functional>
#include <vector>

#include "broker/Broker.h"
#include "broker/UpCalls.h"
#include "operations/LoadedLibrary.h"
#include "operations/ProviderPool.h"
#include "operations/ProviderRegistry.h"
#include "operations/Request.h"

namespace cimhost {

/** What an object manager works with. */
struct ObjectManagerOptions {
    LibraryOptions libraries{};
    ClassShapeLookup classShape{};                ///< none: no class is known; see BrokerOptions
    std::function<void(const LogRecord&)> log{};  ///< none: what providers log is dropped
    ContextEntries context{};                     ///< entries that every request's context has, such as CMPIPrincipal
    Manager manager = Manager::standard;          ///< whose behaviour towards providers and clients is played
};

/**
 * The embedded object manager: sends each request to the provider that is registered for it, and tells what its
 * answer means. The operations are the same for a user and for a provider's up-call (UpCalls); they run on the
 * calling thread, unless the manager that is played has it otherwise, may run on several threads at a time, and no lock
 * is held while a provider runs, except by its factory.
 *
 * A status that is not OK comes with a text. Besides what providers answer:
 * CMPI_RC_ERR_INVALID_NAMESPACE and CMPI_RC_ERR_INVALID_CLASS when no provider is registered; CMPI_RC_ERR_FAILED
 * when an exception leaves the provider or it returns what the operation does not give;
 * CMPI_RC_ERR_NOT_FOUND when getInstance succeeds without an instance.
 * Where the manager's provider process would have ended, the provider's library is unloaded, without cleanup, as soon
 * as no request is inside: what it had in memory is lost.
 * A provider that cannot be loaded is a LibraryError (to a provider's up-call: CMPI_RC_ERR_FAILED with its text).
 *
 * The context of a request is what the caller gives, completed by the options' entries and by CMPIInvocationFlags
 * (0), CMPIInitNameSpace (the request's namespace) and CMPIPrincipal (empty).
 *
 * All of this is the standard manager; Profile tells in what others differ.
 */
class ObjectManager : public UpCalls {
public:
    ObjectManager(ObjectManagerOptions itsOptions, ProviderRegistry itsRegistry);
    ~ObjectManager() override;

    /**
     * Runs a request against its provider and gives everything back as it came. Association operations go by the
     * association class (the result class, for references): to the provider of that class, to those of its
     * registered subclasses, or, without a class, to those of all registered association classes, each told the
     * class that it is asked for.
     * @return one answer a provider asked; a status other than OK when there was none to ask
     */
    Answer<std::vector<RawAnswer>> run(Request request);

    /**
     * What happens when nobody has asked for anything for a while: providers are cleaned up, and libraries that do not
     * ask to stay are unloaded, to be loaded again when they are needed. Not while a request is inside.
     */
    void idle() { pool.idle(); }

    /**
     * The end of the manager, which does not wait for requests that are inside: all providers are cleaned up for good,
     * and requests that come from then on, up-calls too, are answered CMPI_RC_ERR_FAILED.
     */
    void stop() { pool.stop(); }

    const ProviderRegistry& registry() const { return providers; }
    Broker& broker() { return itsBroker; }

    Answer<std::vector<Instance>> enumerateInstances(const ContextEntries& context, const ObjectPath& path,
                                                     const PropertyList& properties) override;
    Answer<std::vector<ObjectPath>> enumerateInstanceNames(const ContextEntries& context,
                                                           const ObjectPath& path) override;

    /** The first instance that the provider returns. */
    Answer<Instance> getInstance(const ContextEntries& context, const ObjectPath& path,
                                 const PropertyList& properties) override;

    /**
     * The provider is given the instance with exactly its properties, completed by those keys of the path that are
     * not among them, in front. The new path may come back as a path or in an instance; CMPI_RC_ERR_FAILED when
     * neither does.
     */
    Answer<ObjectPath> createInstance(const ContextEntries& context, const ObjectPath& path,
                                      const Instance& instance) override;

    /** The provider is given the instance with exactly its properties. */
    Status modifyInstance(const ContextEntries& context, const ObjectPath& path, const Instance& instance,
                          const PropertyList& properties) override;
    Status deleteInstance(const ContextEntries& context, const ObjectPath& path) override;

    /** @name Association operations
     * The results of all providers asked, in order. The first failure is the answer; but a provider that does not
     * support the operation is passed over if another one does.
     */
    ///@{
    Answer<std::vector<Instance>> associators(const ContextEntries& context, const ObjectPath& path,
                                              const AssociationFilter& filter, const PropertyList& properties) override;
    Answer<std::vector<ObjectPath>> associatorNames(const ContextEntries& context, const ObjectPath& path,
                                                    const AssociationFilter& filter) override;
    Answer<std::vector<Instance>> references(const ContextEntries& context, const ObjectPath& path,
                                             const AssociationFilter& filter, const PropertyList& properties) override;
    Answer<std::vector<ObjectPath>> referenceNames(const ContextEntries& context, const ObjectPath& path,
                                                   const AssociationFilter& filter) override;
    ///@}

private:
    Answer<std::vector<RawAnswer>> runForInstance(Request request);
    Answer<std::vector<RawAnswer>> runForAssociation(Request request);
    std::vector<const ServedClass*> associationsFor(const std::string& nameSpace,
                                                    const std::optional<std::string>& className) const;
    void completeContext(Request& request) const;
    ProviderAddress addressOf(const ServedClass& served) const;

    /** The interface of a class's provider, with the other one where a manager starts both. */
    template <class Interface>
    Interface* started(const ServedClass& served);

    /** What the class's provider answers. */
    template <class Interface>
    RawAnswer ask(const ServedClass& served, const Request& request);

    ContextEntries baseContext;
    ProviderRegistry providers;
    Broker itsBroker;
    ProviderPool pool;
};

}  // namespace cimhost
