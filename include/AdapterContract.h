#pragma once

#include <cmpidt.h>

#include <string>
#include <type_traits>
#include <utility>

/**
 * The interface of adapters. There is one adapter per CIM class: a cursor over the instances that a request's object
 * path selects, which translates between CMPI and the managed element.
 *
 * An entry point creates an adapter on its stack from (broker, context, object path). The adapter starts at the first
 * selected instance, if any. Broker and context are borrowed. The returned paths and instances belong to the object
 * manager, and are null if the broker cannot create them. Any operation may throw an exception derived from
 * std::exception. So may the destructor, if a change cannot be written.
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
namespace KO::LeaseWarrantyProvider::AdapterContract {

template <class Adapter>
using ObjectPathOf = decltype(std::declval<Adapter&>().getObjectPath());

template <class Adapter>
using InstanceOf = decltype(std::declval<Adapter&>().getCMPIInstance(std::declval<const char**>()));

/** Whether a class has the operations of every adapter. */
template <class Adapter>
constexpr bool fulfilled =
    std::is_constructible_v<Adapter, const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*>&&
        std::is_convertible_v<Adapter&, bool>&& std::is_same_v<ObjectPathOf<Adapter>, CMPIObjectPath*>&&
            std::is_same_v<InstanceOf<Adapter>, CMPIInstance*>&& std::is_void_v<decltype(++std::declval<Adapter&>())>;

/** Whether an adapter can be constructed from a namespace, for CreateInstance. */
template <class Adapter>
constexpr bool creates = std::is_constructible_v<Adapter, const CMPIBroker*, const CMPIContext*, std::string>;

}  // namespace KO::LeaseWarrantyProvider::AdapterContract
