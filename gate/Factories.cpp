#include "AssociationOperations.h"
#include "Calls.h"
#include "FixedMessage.h"
#include "InstanceOperations.h"
#include "Provider.h"

#include <cxxabi.h>
#include <dlfcn.h>

#include <chrono>
#include <cstddef>
#include <exception>

namespace gate {

namespace {

/**
 * How long an end waits for requests that wait for somebody else: up-calls, slow clients. They may wait for the very
 * thread that ends the manager or the process.
 */
constexpr std::chrono::seconds patience{5};

/** Goes before the provider's own static objects, which were there first: from then on nobody is inside. */
const struct GateKeeper {
    ~GateKeeper() { theGate.close(patience, Gate::Closing::forGood); }
} gateKeeper;

FixedMessage closed(closedText);
FixedMessage stays("The provider keeps its tables in memory.");
FixedMessage answersNoQueries("This provider answers no queries. Enumerate the class instead.");
FixedMessage lacksBroker("An object manager that loads this provider has to give it a broker.");
FixedMessage unspoken("The object manager could not take the reason. It, or this provider, may lack memory.");

CMPIStatus statusOf(CMPIrc rc, FixedMessage& message) {
    return {rc, message.handle()};
}

/** A status with its reason, as far as memory and the broker allow; without a broker, with the reason for that. */
CMPIStatus statusOf(const CMPIBroker* broker, CMPIrc rc, const char* text, const char* detail = "") noexcept {
    if (broker == nullptr) {
        return statusOf(rc, closed);
    }
    CMPIString* message = nullptr;
    try {
        message = make<&CMPIBrokerEncFT::newString>(broker, (std::string(text) + detail).c_str());
    } catch (...) {
        message = nullptr;
    }
    return message != nullptr ? CMPIStatus{rc, message} : statusOf(rc, unspoken);
}

/**
 * Runs what may fail; a status is all that leaves.
 * @param broker answers the broker for a message: the manager may take it along while the work goes on
 */
template <class Broker, class Work>
CMPIStatus guarded(Broker broker, Work work) {
    try {
        work();
        return {CMPI_RC_OK, nullptr};
    } catch (const abi::__forced_unwind&) {
        throw;  // the thread is being ended: no exception, and not to be stopped
    } catch (const Ended&) {
        return statusOf(CMPI_RC_ERR_FAILED, closed);
    } catch (const Failure& failure) {
        return statusOf(broker(), failure.rc, failure.text.c_str());
    } catch (const std::exception& exception) {
        return statusOf(broker(), CMPI_RC_ERR_FAILED, "The request broke off: ", exception.what());
    } catch (...) {
        return statusOf(broker(), CMPI_RC_ERR_FAILED, "The request broke off by an exception of an unknown kind.");
    }
}

/** A request's stay in the library, from before its first call of the broker to after its last one. */
class Visit {
public:
    Visit() noexcept : isLetIn(theGate.arrive()) {}
    ~Visit() {
        if (isLetIn) {
            theGate.depart();
        }
    }
    Visit(const Visit&) = delete;
    Visit& operator=(const Visit&) = delete;

    const bool isLetIn;
    const std::size_t round = theGate.round();
};

template <class Operation>
CMPIStatus serve(const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path,
                 Operation operation) {
    const Visit visit;
    const CMPIBroker* broker = Provider::manager();
    if (!visit.isLetIn || broker == nullptr) {
        return statusOf(CMPI_RC_ERR_FAILED, closed);
    }
    const Request request{broker, context, result, path, visit.round};
    // Words for it are only its own manager's to make.
    const auto itsBroker = [&] { return request.hasManager() ? Provider::manager() : nullptr; };
    return guarded(itsBroker, [&] { operation(request); });
}

/** Keeps this library and those that it needs in the process: a request that outlasts the end is in them. */
void stayLoaded() {
    Dl_info self{};
    if (dladdr(&theGate, &self) != 0) {
        dlopen(self.dli_fname, RTLD_LAZY | RTLD_NOLOAD | RTLD_NODELETE);  // never closed, which is what it is for
    }
}

/**
 * Idle, the library asks to stay: the provider's tables would be read again from files that keep less than memory.
 * When the object manager ends, it takes its broker along: no request may be left that calls it.
 */
CMPIStatus cleanUp(const CMPIContext* context, CMPIBoolean terminating) {
    if (terminating == 0) {
        return statusOf(CMPI_RC_DO_NOT_UNLOAD, stays);
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    theGate.close(patience, Gate::Closing::untilOpened,
                  [&] { status = guarded(Provider::manager, [&] { Provider::end(context); }); });
    if (theGate.hasOthers()) {
        stayLoaded();
    }
    return status;
}

CMPIStatus instanceCleanup(CMPIInstanceMI*, const CMPIContext* context, CMPIBoolean terminating) {
    return cleanUp(context, terminating);
}

CMPIStatus enumInstanceNames(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                             const CMPIObjectPath* path) {
    return serve(context, result, path, enumerateInstanceNames);
}

CMPIStatus enumInstances(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                         const CMPIObjectPath* path, const char** properties) {
    return serve(context, result, path, [&](const Request& request) { enumerateInstances(request, properties); });
}

CMPIStatus get(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path,
               const char** properties) {
    return serve(context, result, path, [&](const Request& request) { getInstance(request, properties); });
}

CMPIStatus create(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path,
                  const CMPIInstance* instance) {
    return serve(context, result, path, [&](const Request& request) { createInstance(request, instance); });
}

CMPIStatus modify(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path,
                  const CMPIInstance* instance, const char** properties) {
    return serve(context, result, path, [&](const Request& request) { modifyInstance(request, instance, properties); });
}

CMPIStatus remove(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path) {
    return serve(context, result, path, deleteInstance);
}

CMPIStatus execQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                     const char*) {
    return statusOf(CMPI_RC_ERR_NOT_SUPPORTED, answersNoQueries);
}

CMPIStatus associationCleanup(CMPIAssociationMI*, const CMPIContext* context, CMPIBoolean terminating) {
    return cleanUp(context, terminating);
}

CMPIStatus associate(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                     const CMPIObjectPath* path, const char* associationClass, const char* resultClass,
                     const char* role, const char* resultRole, const char** properties) {
    return serve(context, result, path, [&](const Request& request) {
        associators(request, {associationClass, resultClass, role, resultRole}, properties);
    });
}

CMPIStatus associateNames(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                          const CMPIObjectPath* path, const char* associationClass, const char* resultClass,
                          const char* role, const char* resultRole) {
    return serve(context, result, path, [&](const Request& request) {
        associatorNames(request, {associationClass, resultClass, role, resultRole});
    });
}

CMPIStatus refer(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path,
                 const char* resultClass, const char* role, const char** properties) {
    return serve(context, result, path, [&](const Request& request) {
        references(request, {nullptr, resultClass, role, nullptr}, properties);
    });
}

CMPIStatus referNames(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                      const CMPIObjectPath* path, const char* resultClass, const char* role) {
    return serve(context, result, path, [&](const Request& request) {
        referenceNames(request, {nullptr, resultClass, role, nullptr});
    });
}

CMPIInstanceMIFT instanceFunctions{
    CMPIVersion200,
    CMPIVersion200,
    "instanceLeaseAndWarrantyGate",
    instanceCleanup,
    enumInstanceNames,
    enumInstances,
    get,
    create,
    modify,
    remove,
    execQuery,
};

CMPIAssociationMIFT associationFunctions{
    CMPIVersion200, CMPIVersion200, "associationLeaseAndWarrantyGate", associationCleanup, associate, associateNames,
    refer,          referNames,
};

CMPIInstanceMI instanceInterface{nullptr, &instanceFunctions};
CMPIAssociationMI associationInterface{nullptr, &associationFunctions};

/**
 * Connects the provider to a broker, once: managers call factories again and again, maybe with a lock of theirs held,
 * and must not have to wait for requests then. A manager that ended and goes on opens the gate again.
 */
void connect(const CMPIBroker* broker) {
    if (!Provider::isConnectedTo(broker) && !Provider::connect(broker)) {
        fail(CMPI_RC_ERR_FAILED, "The provider behind the gate does not give its interfaces.");
    }
}

/** Answers an interface once the provider is connected; null, with the reason in the status, otherwise. */
template <class Interface>
Interface* open(const CMPIBroker* broker, CMPIStatus* rc, Interface& interface) {
    CMPIStatus status = statusOf(CMPI_RC_ERR_INVALID_PARAMETER, lacksBroker);
    if (broker != nullptr && !theGate.open()) {
        status = statusOf(CMPI_RC_ERR_FAILED, closed);
    } else if (broker != nullptr) {
        const Visit visit;
        status = guarded([&] { return broker; }, [&] { connect(broker); });
    }
    if (rc != nullptr) {
        *rc = status;
    }
    return status.rc == CMPI_RC_OK ? &interface : nullptr;
}

}  // namespace

}  // namespace gate

extern "C" {

__attribute__((visibility("default"))) CMPIInstanceMI* LeaseAndWarrantyGate_Create_InstanceMI(const CMPIBroker* broker,
                                                                                              const CMPIContext*,
                                                                                              CMPIStatus* rc) {
    return gate::open(broker, rc, gate::instanceInterface);
}

__attribute__((visibility("default"))) CMPIAssociationMI* LeaseAndWarrantyGate_Create_AssociationMI(
    const CMPIBroker* broker, const CMPIContext*, CMPIStatus* rc) {
    return gate::open(broker, rc, gate::associationInterface);
}
}
