#include "lab/emulation/Emulations.h"
#include "lab/emulation/TypeCoercion.h"
#include "operations/RequestThread.h"

namespace cimhost::lab {
namespace {

/** Elements have the state CMPI_nullValue, with status OK and a valid object. */
CMPIData getNextMarkedNull(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    CMPIData element = standardTables().enumeration.getNext(enumeration, rc);
    if (element.state == CMPI_goodValue) {
        element.state = CMPI_nullValue;
    }
    return element;
}

FunctionTables openPegasusTables() {
    FunctionTables tables = standardTables();
    tables.enumeration.getNext = getNextMarkedNull;
    return tables;
}

/** OpenPegasus checks and completes the values that clients send, and rejects results that the standard forbids. */
class OpenPegasusEmulation : public ManagerBehaviour {
public:
    explicit OpenPegasusEmulation(CreationKey itsCreationKey) : creationKey(itsCreationKey) {}

    const FunctionTables& tables() const override {
        static const FunctionTables all = openPegasusTables();
        return all;
    }
    bool hasMemoryTable() const override { return false; }

    ProviderPolicy policy() const override {
        ProviderPolicy policy;
        policy.factory = FactoryChoice::neither;
        policy.bindsLazily = true;
        policy.staysOnlyIfAllAsk = true;
        return policy;
    }

    Status coerceTypes(Request& request, const Broker& broker) const override { return coerceToClass(request, broker); }

    void adapt(Request& request, const Broker& broker) const override {
        trimStrings(request, [](char each) { return each == ' '; });
        completeInstance(request, broker, Value::null(CMPI_string), creationKey);
        completePropertyList(request, broker);
    }

    ResultRules resultRules(Operation operation) const override {
        ResultRules rules;
        rules.refusesInstances = operation == Operation::createInstance;
        rules.refusesToBeEmpty = operation == Operation::getInstance;
        return rules;
    }

    /** Uses a new thread, also for up-calls. */
    void onRequestThread(const std::function<void()>& callProvider) const override { onNewThread(callProvider); }

    using ManagerBehaviour::statusOf;
    Status statusOf(const ProviderResponse& response, Operation operation) const override {
        if (response.threw) {
            return {CMPI_RC_ERR_FAILED, "Unknown error."};
        }
        const bool isEmpty = isReferenceOperation(operation) && response.status.rc == CMPI_RC_ERR_NOT_SUPPORTED;
        return isEmpty ? Status{} : ManagerBehaviour::statusOf(response, operation);
    }

    StatusOr<ObjectPath> createdPath(const ProviderResponse& response) const override {
        if (eventsOf<ObjectPath>(response.events).empty()) {
            return {{CMPI_RC_ERR_FAILED,
                     "The provider accepted CreateInstance, but returned no path: the client would have got a broken "
                     "response."},
                    {}};
        }
        return ManagerBehaviour::createdPath(response);
    }

private:
    CreationKey creationKey;
};

}  // namespace

std::shared_ptr<const ManagerBehaviour> openPegasusEmulation(CreationKey creationKey) {
    return std::make_shared<OpenPegasusEmulation>(creationKey);
}

Status crashed(const std::string& reason) {
    return {CMPI_RC_ERR_FAILED, "The manager's provider process would have died: " + reason};
}

}  // namespace cimhost::lab
