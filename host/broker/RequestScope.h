#pragma once

#include "broker/Broker.h"
#include "broker/ObjectContents.h"
#include "model/ResultEvent.h"
#include "model/Value.h"

namespace cimhost {

/**
 * Owns the objects that providers create on this thread during one request. Scopes can be nested, for requests that
 * providers send, and are destroyed in reverse order.
 */
class RequestScope {
public:
    explicit RequestScope(Broker& itsBroker);
    ~RequestScope();
    RequestScope(const RequestScope&) = delete;
    RequestScope& operator=(const RequestScope&) = delete;

    /** @name Objects for the request's provider
     * Created from plain values; valid for the lifetime of the scope.
     */
    ///@{
    CMPIContext* context(const ContextEntries& entries);
    CMPIObjectPath* objectPath(const ObjectPath& path);
    CMPIInstance* instance(const Instance& instance);

    /** @param events receives the results of the provider; must outlive the scope */
    CMPIResult* result(ResultEvents& events, const ResultRules& rules = {});
    ///@}

    Arena& arena() { return objects; }

    /** Whether the provider released a path that the result keeps (ResultRules::keepsPaths). */
    static bool isPathReleased(const CMPIResult* result);

private:
    Broker& broker;
    Arena objects;
};

/** Converts a provider's status. The message is empty if there is none or it cannot be read. */
Status statusFrom(const CMPIStatus& status);

}  // namespace cimhost
