#pragma once

#include "broker/Broker.h"
#include "broker/ObjectContents.h"
#include "model/ResultEvent.h"
#include "model/Value.h"

namespace cimhost {

/**
 * One request on this thread: while it lives, what providers make through the broker belongs to it, and it frees all
 * of it in the end. Scopes nest, for requests that come out of requests; they end in reverse order.
 */
class RequestScope {
public:
    explicit RequestScope(Broker& itsBroker);
    ~RequestScope();
    RequestScope(const RequestScope&) = delete;
    RequestScope& operator=(const RequestScope&) = delete;

    /** @name Objects for the request's provider
     * Made from plain values; they live as long as the scope.
     */
    ///@{
    CMPIContext* context(const ContextEntries& entries);
    CMPIObjectPath* objectPath(const ObjectPath& path);
    CMPIInstance* instance(const Instance& instance);

    /** @param events receives what the provider returns; must live as long as the scope */
    CMPIResult* result(ResultEvents& events, const ResultRules& rules = {});
    ///@}

    Arena& arena() { return objects; }

    /** Whether the provider released a path that such a result keeps. */
    static bool isPathReleased(const CMPIResult* result);

private:
    Broker& broker;
    Arena objects;
};

/** A status as a provider answers it, with the text of its message; empty when there is none or it cannot be had. */
Status statusFrom(const CMPIStatus& status);

}  // namespace cimhost
