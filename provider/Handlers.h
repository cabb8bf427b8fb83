#pragma once

#include "AdapterContract.h"
#include "Request.h"

#include <cmpift.h>

/**
 * Handlers of the operations. They pass the adapter's results to the object manager one by one and skip null pointers.
 */
namespace KO::LeaseWarrantyProvider::Handlers {

inline void give(const CMPIResult* result, const CMPIInstance* instance) {
    if (instance != nullptr) {
        result->ft->returnInstance(result, instance);
    }
}

inline void give(const CMPIResult* result, const CMPIObjectPath* path) {
    if (path != nullptr) {
        result->ft->returnObjectPath(result, path);
    }
}

/**
 * Iterates over the adapter of the request's path, returns the result of `take` for each element, and calls returnDone.
 */
template <class Adapter, class Take>
void walk(const Request& request, Take take) {
    static_assert(AdapterContract::fulfilled<Adapter>);
    Adapter adapter(request.broker, request.context, request.path);
    while (adapter) {
        give(request.result, take(adapter));
        ++adapter;
    }
    request.result->ft->returnDone(request.result);
}

template <class Adapter>
void names(Request& request) {
    walk<Adapter>(request, [](Adapter& adapter) { return adapter.getObjectPath(); });
}

template <class Adapter>
void instances(Request& request) {
    walk<Adapter>(request, [&](Adapter& adapter) { return adapter.getCMPIInstance(request.properties); });
}

template <class Adapter>
void associators(Request& request) {
    walk<Adapter>(request, [&](Adapter& adapter) { return adapter.getAssociator(request.properties); });
}

template <class Adapter>
void associatorNames(Request& request) {
    walk<Adapter>(request, [](Adapter& adapter) { return adapter.getAssociatorNames(); });
}

/** Takes the new record's key from the path. Returns the new instance, not its path. */
template <class Adapter>
void create(Request& request) {
    static_assert(AdapterContract::creates<Adapter>);
    Adapter adapter(request.broker, request.context, request.nameSpace);
    give(request.result, adapter.createCMPIInstance(request.path));
    request.result->ft->returnDone(request.result);
}

/** Returns no result and does not call returnDone. */
template <class Adapter>
void modify(Request& request) {
    Adapter adapter(request.broker, request.context, request.path);
    adapter.modifyCMPIInstance(request.instance, request.properties);
}

/** Returns no result and does not call returnDone. */
template <class Adapter>
void remove(Request& request) {
    Adapter adapter(request.broker, request.context, request.path);
    adapter.deleteCMPIInstance();
}

inline void notSupported(Request& request) {
    request.status.rc = CMPI_RC_ERR_NOT_SUPPORTED;
}

inline void invalidClass(Request& request) {
    request.status.rc = CMPI_RC_ERR_INVALID_CLASS;
}

}  // namespace KO::LeaseWarrantyProvider::Handlers
