#include "broker/RequestScope.h"

namespace cimhost {

RequestScope::RequestScope(Broker& itsBroker) : broker(itsBroker), objects(itsBroker.tables(), &itsBroker.lasting()) {
    broker.enter(objects);
}

RequestScope::~RequestScope() {
    broker.leave(objects);
}

CMPIContext* RequestScope::context(const ContextEntries& entries) {
    return objects.make<CMPIContext>({entries});
}

CMPIObjectPath* RequestScope::objectPath(const ObjectPath& path) {
    return objects.make<CMPIObjectPath>(path);
}

CMPIInstance* RequestScope::instance(const Instance& instance) {
    return objects.make<CMPIInstance>({instance, broker.classShape(instance.path.className), {}});
}

CMPIResult* RequestScope::result(ResultEvents& events) {
    return objects.make<CMPIResult>({&events});
}

Status statusFrom(const CMPIStatus& status) {
    const auto* message = objectOf(status.msg);
    return {status.rc, message == nullptr ? std::string{} : *message->content};
}

}  // namespace cimhost
