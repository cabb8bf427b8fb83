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

/** The factory to call if a library has both "<name>_Create_..." and "_Generic_Create_...". */
enum class FactoryChoice {
    named,
    generic,
    neither  ///< the library is rejected
};

/** Options for loading libraries and for calls to factories and cleanup functions. */
struct ProviderPolicy {
    FactoryChoice factory = FactoryChoice::named;
    bool bindsLazily = false;             ///< functions of a library are resolved at their first call
    bool startsAllInterfaces = false;     ///< the instance and association interfaces of a class are created together
    bool startsProviderPerClass = false;  ///< factories are called once per requested class, not once per provider
    bool startsConcurrently = false;      ///< factories of different providers can run concurrently
    bool staysOnlyIfAllAsk = false;       ///< an idle library stays only if all its interfaces ask to stay
};

/**
 * The behaviour in which CMPI object managers differ. This class behaves as the standard says; a subclass emulates
 * another object manager. The functions are called concurrently.
 */
class ManagerBehaviour {
public:
    ManagerBehaviour() = default;
    virtual ~ManagerBehaviour() = default;
    ManagerBehaviour(const ManagerBehaviour&) = delete;
    ManagerBehaviour& operator=(const ManagerBehaviour&) = delete;

    /** The standard behaviour; valid until the program ends. */
    static const ManagerBehaviour& standard();

    /** @name The broker */
    ///@{
    virtual const FunctionTables& tables() const { return standardTables(); }
    virtual bool hasMemoryTable() const { return true; }
    ///@}

    /** @name Providers */
    ///@{
    virtual ProviderPolicy policy() const { return {}; }

    /** The status that a client receives if a library cannot be loaded; none: the exception is thrown to the caller. */
    virtual std::optional<Status> statusOf(const LibraryNotLoaded&) const { return std::nullopt; }
    ///@}

    /** @name Requests that a provider is to receive */
    ///@{
    /** The context entry CMPIPrincipal of a request that has none. */
    virtual Value principal() const { return Value::of(""); }

    /** Whether an association operation calls a provider once per association class, and passes the class. */
    virtual bool namesAssociationClass() const { return true; }

    /** Checks, and can convert, the types of the properties that a client sent. @return not OK: reject the request */
    virtual Status coerceTypes(Request& /*request*/, const Broker& /*broker*/) const { return {}; }

    /** Changes a request into the form that the manager passes to providers. */
    virtual void adapt(Request& /*request*/, const Broker& /*broker*/) const {}

    virtual ResultRules resultRules(Operation /*operation*/) const { return {}; }

    /** Calls the provider on the thread that the manager uses for the request, and waits until it returns. */
    virtual void onRequestThread(const std::function<void()>& callProvider) const { callProvider(); }
    ///@}

    /** @name Responses */
    ///@{
    /** A sentence with the cause if the response would have crashed the provider's process, otherwise empty. */
    virtual std::string crashReason(const ProviderResponse& /*response*/, Operation /*operation*/) const { return {}; }

    /** The status that the client receives for a provider's response: OK, or a code with a message. */
    virtual Status statusOf(const ProviderResponse& response, Operation operation) const;

    /** The path of a created instance: that of the first result that is a path or an instance. */
    virtual StatusOr<ObjectPath> createdPath(const ProviderResponse& response) const;
    ///@}
};

}  // namespace cimhost
