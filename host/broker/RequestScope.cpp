#include "broker/RequestScope.h"

#include <cstring>

#include "cim/CmpiAccess.h"

namespace cimhost {

RequestScope::RequestScope(Broker& itsBroker) : broker(itsBroker), objects(itsBroker.tables(), &itsBroker.lasting()) {
    broker.enter(objects);
}

RequestScope::~RequestScope() {
    broker.leave(objects);
}

CMPIContext* RequestScope::context(const ContextEntries& entries) {
    return objects.make<CMPIContext>(entries);
}

CMPIObjectPath* RequestScope::objectPath(const ObjectPath& path) {
    return objects.make<CMPIObjectPath>(path);
}

CMPIInstance* RequestScope::instance(const Instance& instance) {
    auto classInfo = broker.classInfo(instance.path.className);
    const std::size_t unset = classInfo == nullptr ? 0 : classInfo->properties.size();
    return objects.make<CMPIInstance>({instance, std::move(classInfo), {}, false, 0, unset});
}

CMPIResult* RequestScope::result(ResultEvents& events, const ResultRules& rules) {
    return objects.make<CMPIResult>({&events, rules, {}});
}

bool RequestScope::isPathReleased(const CMPIResult* result) {
    const auto* object = objectOf(result);
    return object != nullptr && object->content->pathReleased != nullptr && *object->content->pathReleased;
}

Status statusFrom(const CMPIStatus& status) {
    // Copy the bytes: reading a value that the enumeration does not have is undefined behaviour.
    static_assert(sizeof status.rc == sizeof(int));
    int rc = CMPI_RC_OK;
    std::memcpy(&rc, &status.rc, sizeof rc);
    return {rc, cim::charactersOf(status.msg).value_or(std::string{})};
}

}  // namespace cimhost
