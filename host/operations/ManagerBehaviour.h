#pragma once

#include <functional>
#include <optional>
#include <string>

#include "broker/Broker.h"
#include "broker/ObjectContents.h"
#include "model/Request.h"
#include "model/Response.h"
#include "operations/LoadedLibrary.h"

namespace cimhost {

/** Which factory creates a provider, "<name>_Create_..." or "_Generic_Create_...", where a library has both. */
enum class FactoryChoice {
    named,
    generic,
    neither  ///< such a library cannot be used
};

/** How an object manager loads libraries, and starts and ends providers. */
struct ProviderPolicy {
    FactoryChoice factory = FactoryChoice::named;
    bool bindsLazily = false;             ///< functions of a library are resolved when they are first called
    bool startsAllInterfaces = false;     ///< the instance and the association interface of a class start together
    bool startsProviderPerClass = false;  ///< factories are called once per requested class, not once per provider
    bool startsConcurrently = false;      ///< factories of different providers may run concurrently
    bool staysOnlyIfAllAsk = false;       ///< an idle library stays if all its interfaces ask for it, not if one does
};

/**
 * The points at which CMPI object managers differ. This class behaves as the standard says; a subclass emulates another
 * object manager. Called concurrently.
 */
class ManagerBehaviour {
public:
    ManagerBehaviour() = default;
    virtual ~ManagerBehaviour() = default;
    ManagerBehaviour(const ManagerBehaviour&) = delete;
    ManagerBehaviour& operator=(const ManagerBehaviour&) = delete;

    /** The standard behaviour; lives as long as the program. */
    static const ManagerBehaviour& standard();

    /** @name The broker */
    ///@{
    virtual const FunctionTables& tables() const { return standardTables(); }
    virtual bool hasMemoryTable() const { return true; }
    ///@}

    /** @name Providers */
    ///@{
    virtual ProviderPolicy policy() const { return {}; }

    /** What a client receives when a library cannot be loaded; none: the error is the caller's. */
    virtual std::optional<Status> statusOf(const LibraryNotLoaded&) const { return std::nullopt; }
    ///@}

    /** @name Requests, before a provider receives them */
    ///@{
    /** The context entry CMPIPrincipal of requests without one. */
    virtual Value principal() const { return Value::of(""); }

    /** Whether an association operation calls a provider once per association class, and names the class. */
    virtual bool namesAssociationClass() const { return true; }

    /** Checks the types of the properties that a client sent, and may convert them. @return why it is refused, or OK */
    virtual Status coerceTypes(Request& request, const Broker& broker) const;

    /** Changes a request into the form in which the provider receives it. */
    virtual void adapt(Request& request, const Broker& broker) const;

    virtual ResultRules resultRules(Operation operation) const;

    /** Calls the provider, on the thread that the manager uses for the request, and waits for its return. */
    virtual void onRequestThread(const std::function<void()>& callProvider) const { callProvider(); }
    ///@}

    /** @name Responses */
    ///@{
    /** Why the provider process would have ended with the response, as a sentence; empty if it lives. */
    virtual std::string crashReason(const ProviderResponse& response, Operation operation) const;

    /** The status of one provider's response as the client receives it: OK, or a code with a message. */
    virtual Status statusOf(const ProviderResponse& response, Operation operation) const;

    /** The path of a created instance: the first that is returned, as such or in an instance. */
    virtual StatusOr<ObjectPath> createdPath(const ProviderResponse& response) const;
    ///@}
};

}  // namespace cimhost
