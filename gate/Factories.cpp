#include <cxxabi.h>

#include <exception>

#include "gate/operations/Operations.h"
#include "gate/session/ProviderConnection.h"

// The exported factories and the function tables of the two interfaces.

namespace gate {

namespace {

StaticString shuttingDown("The provider is shutting down. Try again after the object manager has restarted.");
StaticString stays("The provider keeps its tables in memory.");
StaticString supportsNoQueries("This provider does not support queries. Enumerate the class instead.");
StaticString lacksBroker("The factory was called without a broker.");
StaticString lacksMessage(
    "The error message could not be created. The object manager or this provider may be out of memory.");

CMPIStatus statusOf(CMPIrc rc, StaticString& message) {
    return {rc, message.handle()};
}

/** A status with a message that the broker creates; without a broker, with the message of a shutdown. */
CMPIStatus statusOf(const CMPIBroker* broker, CMPIrc rc, const char* text, const char* detail = "") noexcept {
    if (broker == nullptr) {
        return statusOf(rc, shuttingDown);
    }
    try {
        CMPIString* message = make<&CMPIBrokerEncFT::newString>(broker, (std::string(text) + detail).c_str());
        return message != nullptr ? CMPIStatus{rc, message} : statusOf(rc, lacksMessage);
    } catch (...) {
        return statusOf(rc, lacksMessage);
    }
}

/**
 * Converts exceptions to a status.
 * @param broker a function that returns the broker to create a message with, or null if there is none
 */
template <class Broker, class Work>
CMPIStatus guarded(Broker broker, Work work) {
    try {
        work();
        return {CMPI_RC_OK, nullptr};
    } catch (const abi::__forced_unwind&) {
        throw;  // the thread is being cancelled
    } catch (const ManagerGone&) {
        return statusOf(CMPI_RC_ERR_FAILED, shuttingDown);
    } catch (const Failure& failure) {
        return statusOf(broker(), failure.rc, failure.message.c_str());
    } catch (const std::exception& exception) {
        return statusOf(broker(), CMPI_RC_ERR_FAILED, "The request failed: ", exception.what());
    } catch (...) {
        return statusOf(broker(), CMPI_RC_ERR_FAILED, "The request failed with an exception of an unknown type.");
    }
}

/** Implements a function of an interface: runs an operation and converts its exceptions. */
template <auto operation, class Interface, class... Arguments>
CMPIStatus runOperation(Interface*, const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path,
                        Arguments... arguments) {
    const ActiveRequest active;
    const ClientRequest request{context, result, path};
    return guarded([&] { return request.brokerOrNull(); },
                   [&] {
                       ManagerGone::throwUnless(active.isAdmitted);
                       request.broker();  // throws if there is none
                       operation(request, arguments...);
                   });
}

/** Refuses to be unloaded while idle, because the provider's tables may have values that its files do not preserve. */
template <class Interface>
CMPIStatus cleanUp(Interface*, const CMPIContext* context, CMPIBoolean isTerminating) {
    if (isTerminating == 0) {
        return statusOf(CMPI_RC_DO_NOT_UNLOAD, stays);
    }
    return guarded([] { return theConnection.broker(); }, [&] { theConnection.shutdown(context); });
}

CMPIInstanceMIFT instanceFunctions{
    CMPIVersion200,
    CMPIVersion200,
    "instanceLeaseAndWarrantyGate",
    cleanUp,
    runOperation<enumerateInstanceNames>,
    runOperation<enumerateInstances>,
    runOperation<getInstance>,
    runOperation<createInstance>,
    runOperation<modifyInstance>,
    runOperation<deleteInstance>,
    [](CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*, const char*) {
        return statusOf(CMPI_RC_ERR_NOT_SUPPORTED, supportsNoQueries);
    },
};

CMPIAssociationMIFT associationFunctions{
    CMPIVersion200,
    CMPIVersion200,
    "associationLeaseAndWarrantyGate",
    cleanUp,
    runOperation<associators>,
    runOperation<associatorNames>,
    runOperation<references>,
    runOperation<referenceNames>,
};

CMPIInstanceMI instanceInterface{nullptr, &instanceFunctions};
CMPIAssociationMI associationInterface{nullptr, &associationFunctions};

/** Connects the provider and returns an interface. If that fails, returns null, with the reason in the status. */
template <class Interface>
Interface* open(const CMPIBroker* broker, CMPIStatus* rc, Interface& interface) {
    const CMPIStatus status = broker == nullptr
                                  ? statusOf(CMPI_RC_ERR_INVALID_PARAMETER, lacksBroker)
                                  : guarded([&] { return broker; }, [&] { theConnection.connect(broker); });
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
