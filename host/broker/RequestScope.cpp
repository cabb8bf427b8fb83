#include "broker/RequestScope.h"

#include <cstring>

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
    return objects.make<CMPIInstance>({instance, broker.classInfo(instance.path.className), {}});
}

CMPIResult* RequestScope::result(ResultEvents& events, const ResultRules& rules) {
    return objects.make<CMPIResult>({&events, rules, {}});
}

bool RequestScope::isPathReleased(const CMPIResult* result) {
    const auto* object = objectOf(result);
    return object != nullptr && object->content->pathReleased != nullptr && *object->content->pathReleased;
}

namespace {

/** Through its table: a message need not be one of this broker's strings. */
std::string textOf(const CMPIString* message) {
    if (message == nullptr || message->ft == nullptr || message->ft->getCharPtr == nullptr) {
        return {};
    }
    const char* text = message->ft->getCharPtr(message, nullptr);
    return text == nullptr ? "" : text;
}

}  // namespace

Status statusFrom(const CMPIStatus& status) {
    // Read as the number that it is: an enumeration must not be loaded with a value that it cannot have.
    static_assert(sizeof status.rc == sizeof(int));
    int rc = CMPI_RC_OK;
    std::memcpy(&rc, &status.rc, sizeof rc);
    return {rc, textOf(status.msg)};
}

}  // namespace cimhost
