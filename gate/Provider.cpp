#include "Provider.h"

#include "Calls.h"
#include "Objects.h"
#include "WrappedBroker.h"

#include <algorithm>
#include <mutex>
#include <optional>
#include <utility>

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
std::mutex watchMutex;
Provider::Watch* watches = nullptr;

/** The object manager's broker once the provider is connected to it, with its tables as they were then. */
struct Manager {
    std::mutex mutex{};  ///< held for moments only: factories must not have to wait for requests
    const CMPIBroker* broker = nullptr;
    CMPIBroker tables{};

    void set(const CMPIBroker* itsBroker) {
        const std::lock_guard<std::mutex> lock(mutex);
        broker = itsBroker;
        tables = itsBroker == nullptr ? CMPIBroker{} : *itsBroker;
    }
};

Manager connected;

/** Whatever the namespace: the provider has one table a class. */
bool sameInstance(const OwnPath& one, const OwnPath& other) {
    constexpr const char* key = "InstanceID";
    return sameName(classNameOf(one.handle()), classNameOf(other.handle())) && one.key(key) == other.key(key);
}

void requireOk(const CMPIStatus& status) {
    if (status.rc == CMPI_RC_OK) {
        return;
    }
    const std::string reason = textOf(status.msg);
    fail(status.rc, reason.empty() ? "The provider answers code " + std::to_string(status.rc) + "." : reason);
}

/** Calls a function of one of the provider's interfaces that answers into the result. */
template <auto function, class Interface, class... Arguments>
void call(CapturedResult& result, Interface* interface, const CMPIContext* context, Arguments... arguments) {
    connection.broker->forgetFailures();
    requireOk((interface->ft->*function)(interface, context, &result.handle, arguments...));
    // The provider leaves out what it cannot make.
    require(!connection.broker->hasFailed(), "make the paths and instances of the answer");
}

void requireDone(const CapturedResult& result) {
    if (!result.isDone) {
        fail(CMPI_RC_ERR_FAILED, "The provider broke off its answer. The agent's log, level 3000, says why.");
    }
}

/** The same for an answer that has to be ended. */
template <auto function, class Interface, class... Arguments>
void answer(CapturedResult& result, Interface* interface, const CMPIContext* context, Arguments... arguments) {
    call<function>(result, interface, context, arguments...);
    requireDone(result);
}

}  // namespace

bool Provider::connect(const CMPIBroker* manager) {
    const Turn turn;
    connection.broker.emplace(manager);
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const CMPIBroker* broker = connection.broker->handle();
    connection.instances = LeaseAndWarrantyProvider_Create_InstanceMI(broker, nullptr, &status);
    connection.associations = LeaseAndWarrantyProvider_Create_AssociationMI(broker, nullptr, &status);
    const bool isConnected = connection.instances != nullptr && connection.associations != nullptr;
    connected.set(isConnected ? manager : nullptr);
    return isConnected;
}

bool Provider::isConnectedTo(const CMPIBroker* manager) {
    const std::lock_guard<std::mutex> lock(connected.mutex);
    const CMPIBroker& tables = connected.tables;
    return connected.broker == manager && tables.bft == manager->bft && tables.eft == manager->eft &&
           tables.xft == manager->xft && tables.mft == manager->mft;
}

const CMPIBroker* Provider::manager() {
    const std::lock_guard<std::mutex> lock(connected.mutex);
    return connected.broker;
}

Provider::Provider(const Request& request) : context(request.context) {
    request.requireManager();
    request.broker = manager();
    if (request.broker == nullptr) {
        fail(CMPI_RC_ERR_FAILED, closedText);
    }
}

void Provider::end(const CMPIContext* context) {
    if (manager() != nullptr) {
        connection.instances->ft->cleanup(connection.instances, context, 1);
        connection.associations->ft->cleanup(connection.associations, context, 1);
    }
    connected.set(nullptr);
}

Provider::Paths Provider::names(const OwnPath& classPath) const {
    CapturedResult result;
    answer<&CMPIInstanceMIFT::enumerateInstanceNames>(result, connection.instances, context, classPath.handle());
    return result.paths;
}

Provider::Instances Provider::instances(const OwnPath& classPath) const {
    CapturedResult result;
    const char** const all = nullptr;
    answer<&CMPIInstanceMIFT::enumerateInstances>(result, connection.instances, context, classPath.handle(), all);
    return result.instances;
}

const CMPIInstance* Provider::get(const OwnPath& path) const {
    CapturedResult result;
    const char** const all = nullptr;
    call<&CMPIInstanceMIFT::getInstance>(result, connection.instances, context, path.handle(), all);
    if (result.instances.empty() && !result.isDone && isListed(path)) {
        requireDone(result);
    }
    return result.instances.empty() ? nullptr : result.instances.front();
}

/** The provider breaks off as well where there is just no such instance: then the class's names do not have it. */
bool Provider::isListed(const OwnPath& path) const {
    const CMPIObjectPath* wanted = path.handle();
    const Paths listed = names(OwnPath(nameSpaceOf(wanted), classNameOf(wanted)));
    return std::any_of(listed.begin(), listed.end(), [&](const auto* each) { return samePath(each, wanted); });
}

void Provider::create(const OwnPath& path) const {
    CapturedResult result;
    const OwnInstance notLookedAt{{}};
    answer<&CMPIInstanceMIFT::createInstance>(result, connection.instances, context, path.handle(),
                                              notLookedAt.handle());
}

// Changes end no answer, not even a good one: who makes one has to look whether it was made.

void Provider::modify(const OwnPath& path, const OwnInstance& instance) const {
    CapturedResult result;
    CMPIInstanceMI* mi = connection.instances;
    requireOk(mi->ft->modifyInstance(mi, context, &result.handle, path.handle(), instance.handle(), nullptr));
}

void Provider::remove(const OwnPath& path) const {
    CapturedResult result;
    CMPIInstanceMI* mi = connection.instances;
    Watch::tell(path);
    requireOk(mi->ft->deleteInstance(mi, context, &result.handle, path.handle()));
}

Provider::Watch::Watch(const OwnPath& path) : watched(path) {
    const std::lock_guard<std::mutex> lock(watchMutex);
    next = std::exchange(watches, this);
}

void Provider::Watch::tell(const OwnPath& removed) {
    const std::lock_guard<std::mutex> lock(watchMutex);
    for (Watch* watch = watches; watch != nullptr; watch = watch->next) {
        watch->isRemoved = watch->isRemoved || sameInstance(watch->watched, removed);
    }
}

Provider::Watch::~Watch() {
    const std::lock_guard<std::mutex> lock(watchMutex);
    Watch** link = &watches;
    while (*link != this) {
        link = &(*link)->next;
    }
    *link = next;
}

Provider::Paths Provider::associatorNames(const OwnPath& path, const char* associationClass) const {
    CapturedResult result;
    const char* const any = nullptr;
    answer<&CMPIAssociationMIFT::associatorNames>(result, connection.associations, context, path.handle(),
                                                  associationClass, any, any, any);
    return result.paths;
}

}  // namespace gate
