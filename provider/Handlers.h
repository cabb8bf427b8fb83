#pragma once

#include <cmpift.h>

#include "AdapterContract.h"
#include "Dispatch.h"

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
 * Iterates over the adapter of the invocation's path, returns the result of `take` for each element, and calls
 * returnDone.
 */
template <class Adapter, class Take>
void walk(const Invocation& invocation, Take take) {
    static_assert(AdapterContract::fulfilled<Adapter>);
    Adapter adapter(invocation.broker, invocation.context, invocation.path);
    while (adapter) {
        give(invocation.result, take(adapter));
        ++adapter;
    }
    invocation.result->ft->returnDone(invocation.result);
}

template <class Adapter>
void names(Invocation& invocation) {
    walk<Adapter>(invocation, [](Adapter& adapter) { return adapter.getObjectPath(); });
}

template <class Adapter>
void instances(Invocation& invocation) {
    walk<Adapter>(invocation, [&](Adapter& adapter) { return adapter.getCMPIInstance(invocation.properties); });
}

template <class Adapter>
void associators(Invocation& invocation) {
    walk<Adapter>(invocation, [&](Adapter& adapter) { return adapter.getAssociator(invocation.properties); });
}

template <class Adapter>
void associatorNames(Invocation& invocation) {
    walk<Adapter>(invocation, [](Adapter& adapter) { return adapter.getAssociatorNames(); });
}

/** Takes the new record's key from the path. Returns the new instance, not its path. */
template <class Adapter>
void create(Invocation& invocation) {
    static_assert(AdapterContract::creates<Adapter>);
    Adapter adapter(invocation.broker, invocation.context, invocation.nameSpace);
    give(invocation.result, adapter.createCMPIInstance(invocation.path));
    invocation.result->ft->returnDone(invocation.result);
}

/** Returns no result and does not call returnDone. */
template <class Adapter>
void modify(Invocation& invocation) {
    Adapter adapter(invocation.broker, invocation.context, invocation.path);
    adapter.modifyCMPIInstance(invocation.instance, invocation.properties);
}

/** Returns no result and does not call returnDone. */
template <class Adapter>
void remove(Invocation& invocation) {
    Adapter adapter(invocation.broker, invocation.context, invocation.path);
    adapter.deleteCMPIInstance();
}

inline void notSupported(Invocation& invocation) {
    invocation.status.rc = CMPI_RC_ERR_NOT_SUPPORTED;
}

inline void invalidClass(Invocation& invocation) {
    invocation.status.rc = CMPI_RC_ERR_INVALID_CLASS;
}

}  // namespace KO::LeaseWarrantyProvider::Handlers
