#pragma once

#include <cmpift.h>

#include <string>
#include <type_traits>
#include <utility>

#include "Dispatch.h"

/**
 * Handlers of the operations. They pass the adapter's results to the object manager one by one and skip null pointers.
 *
 * There is one adapter per CIM class: a cursor over the instances that a request's object path selects, which
 * translates between CMPI and the managed element.
 *
 * An entry point creates an adapter on its stack from (broker, context, object path). The adapter starts at the first
 * selected instance, if any. Broker and context are borrowed. The returned paths and instances belong to the object
 * manager, and are null if the broker cannot create them. Any operation may throw an exception derived from
 * std::exception. The destructor may also throw one, if a change cannot be written.
 *
 * Every adapter has:
 *   operator bool()                  returns whether there is a current instance; for an association, whether to
 *                                    continue the iteration
 *   operator++()                     moves to the next instance
 *   getObjectPath()                  returns the CMPIObjectPath* of the current instance
 *   getCMPIInstance(properties)      returns the CMPIInstance* of the current instance
 * Some have:
 *   a constructor from (broker, context, namespace), which selects all instances
 *   createCMPIInstance(path)         returns the CMPIInstance* of a new record with the path's key
 *   modifyCMPIInstance(instance, properties)   writes the instance's modifiable properties
 *   deleteCMPIInstance()             removes the current instance
 *   getAssociatorNames()             returns the CMPIObjectPath* of the current associated object
 *   getAssociator(properties)        returns the CMPIInstance* of the current associated object
 * Property lists are traced but not applied.
 */
namespace KO::LeaseWarrantyProvider::Handlers {

template <class Adapter>
using ObjectPathOf = decltype(std::declval<Adapter&>().getObjectPath());

template <class Adapter>
using InstanceOf = decltype(std::declval<Adapter&>().getCMPIInstance(std::declval<const char**>()));

/** Whether a class has the operations that every adapter must have. */
template <class Adapter>
constexpr bool isAdapter =
    std::is_constructible_v<Adapter, const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*>&&
        std::is_convertible_v<Adapter&, bool>&& std::is_same_v<ObjectPathOf<Adapter>, CMPIObjectPath*>&&
            std::is_same_v<InstanceOf<Adapter>, CMPIInstance*>&& std::is_void_v<decltype(++std::declval<Adapter&>())>;

/** Whether an adapter can be constructed from a namespace, for CreateInstance. */
template <class Adapter>
constexpr bool creates = std::is_constructible_v<Adapter, const CMPIBroker*, const CMPIContext*, std::string>;

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
 * Iterates over the instances that the invocation's path selects, passes the result of `take` for each one to the
 * object manager, and calls returnDone.
 */
template <class Adapter, class Take>
void walk(const Invocation& invocation, Take take) {
    static_assert(isAdapter<Adapter>);
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

/** Creates a record with the path's key. Returns the new instance, not its path. */
template <class Adapter>
void create(Invocation& invocation) {
    static_assert(creates<Adapter>);
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
