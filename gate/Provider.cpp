#include "Provider.h"

#include "Calls.h"
#include "WrappedBroker.h"

#include <optional>

extern "C" {
CMPIInstanceMI* LeaseAndWarrantyProvider_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIAssociationMI* LeaseAndWarrantyProvider_Create_AssociationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
}

namespace gate {

namespace {

/** What connects the provider; only who has the turn looks at it. */
struct Connection {
    std::optional<WrappedBroker> broker{};
    CMPIInstanceMI* instances = nullptr;
    CMPIAssociationMI* associations = nullptr;
};

Connection connection;

void requireOk(const CMPIStatus& status) {
    if (status.rc == CMPI_RC_OK) {
        return;
    }
    const std::string reason = textOf(status.msg);
    fail(status.rc, reason.empty() ? "The provider answers code " + std::to_string(status.rc) + "." : reason);
}

/** Looks at what the provider passes over in silence: exceptions, and answers that could not be made. */
void requireWhole(const CapturedResult& result) {
    require(!connection.broker->hasFailed(), "make the paths and instances of the answer");
    if (!result.isDone) {
        fail(CMPI_RC_ERR_FAILED, "The provider broke off its answer. The agent's log, level 3000, says why.");
    }
}

/** Calls a function of one of the provider's interfaces that answers into the result. */
template <auto function, class Interface, class... Arguments>
void answer(CapturedResult& result, Interface* interface, const CMPIContext* context, Arguments... arguments) {
    connection.broker->forgetFailures();
    requireOk((interface->ft->*function)(interface, context, &result.handle, arguments...));
    requireWhole(result);
}

}  // namespace

bool Provider::connect(const CMPIBroker* manager) {
    const Turn turn;
    if (!connection.broker || !connection.broker->wraps(manager)) {
        connection.broker.emplace(manager);
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIBroker* broker = connection.broker->handle();
    connection.instances = LeaseAndWarrantyProvider_Create_InstanceMI(broker, nullptr, &status);
    connection.associations = LeaseAndWarrantyProvider_Create_AssociationMI(broker, nullptr, &status);
    return connection.instances != nullptr && connection.associations != nullptr;
}

Provider::Paths Provider::names(const CMPIObjectPath* classPath) const {
    CapturedResult result;
    answer<&CMPIInstanceMIFT::enumerateInstanceNames>(result, connection.instances, context, classPath);
    return result.paths;
}

Provider::Instances Provider::instances(const CMPIObjectPath* classPath) const {
    CapturedResult result;
    const char** const all = nullptr;
    answer<&CMPIInstanceMIFT::enumerateInstances>(result, connection.instances, context, classPath, all);
    return result.instances;
}

const CMPIInstance* Provider::get(const CMPIObjectPath* path) const {
    CapturedResult result;
    const char** const all = nullptr;
    answer<&CMPIInstanceMIFT::getInstance>(result, connection.instances, context, path, all);
    return result.instances.empty() ? nullptr : result.instances.front();
}

void Provider::create(const CMPIObjectPath* path, const CMPIInstance* instance) const {
    CapturedResult result;
    answer<&CMPIInstanceMIFT::createInstance>(result, connection.instances, context, path, instance);
}

// Changes end no answer, not even a good one: who makes one has to look whether it was made.

void Provider::modify(const CMPIObjectPath* path, const CMPIInstance* instance) const {
    CapturedResult result;
    CMPIInstanceMI* mi = connection.instances;
    requireOk(mi->ft->modifyInstance(mi, context, &result.handle, path, instance, nullptr));
}

void Provider::remove(const CMPIObjectPath* path) const {
    CapturedResult result;
    CMPIInstanceMI* mi = connection.instances;
    requireOk(mi->ft->deleteInstance(mi, context, &result.handle, path));
}

Provider::Paths Provider::associatorNames(const CMPIObjectPath* path, const char* associationClass) const {
    CapturedResult result;
    const char* const any = nullptr;
    answer<&CMPIAssociationMIFT::associatorNames>(result, connection.associations, context, path, associationClass, any,
                                                  any, any);
    return result.paths;
}

void Provider::cleanUp() const {
    connection.instances->ft->cleanup(connection.instances, context, 1);
    connection.associations->ft->cleanup(connection.associations, context, 1);
}

}  // namespace gate
