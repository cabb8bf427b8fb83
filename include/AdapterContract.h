#pragma once

#include <cmpidt.h>

#include <string>
#include <type_traits>
#include <utility>

/**
 * What an adapter offers to the entry points. There is one adapter a CIM class: an iterator over the
 * instances that a request's object path selects, translating between CMPI and the managed element.
 *
 * It is constructed on the entry point's stack from (broker, context, object path), stands on the first
 * selected instance, if there is one, and lives for one request. Broker and context are borrowed. The
 * paths and instances that it hands out belong to the object manager, and are null when they cannot be
 * made.
 * Any operation may throw an exception derived from std::exception; so may the destructor, when a
 * change cannot be written.
 *
 * Every adapter has:
 *   operator bool()                  whether it stands on an instance; of an association, whether the walk
 *                                    goes on
 *   operator++()                     moves to the next
 *   getObjectPath()                  CMPIObjectPath* of the current instance
 *   getCMPIInstance(properties)      CMPIInstance* of the current instance
 * Some have:
 *   a constructor from (broker, context, namespace text), for all instances, without selection
 *   createCMPIInstance(path)         CMPIInstance* of a new record with the path's key
 *   modifyCMPIInstance(instance, properties)   writes the instance's modifiable properties
 *   deleteCMPIInstance()             removes the current instance
 *   getAssociatorNames()             CMPIObjectPath* of the current far end of an association
 *   getAssociator(properties)        CMPIInstance* of the same
 * Property lists are traced and never applied.
 */
namespace KO::LeaseWarrantyProvider::AdapterContract {

template <class Adapter>
using ObjectPathOf = decltype(std::declval<Adapter&>().getObjectPath());

template <class Adapter>
using InstanceOf = decltype(std::declval<Adapter&>().getCMPIInstance(std::declval<const char**>()));

/** Whether a class has what every adapter has. */
template <class Adapter>
constexpr bool fulfilled =
    std::is_constructible_v<Adapter, const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*>&&
        std::is_convertible_v<Adapter&, bool>&& std::is_same_v<ObjectPathOf<Adapter>, CMPIObjectPath*>&&
            std::is_same_v<InstanceOf<Adapter>, CMPIInstance*>&& std::is_void_v<decltype(++std::declval<Adapter&>())>;

/** Whether an adapter can be made for creation, from a namespace. */
template <class Adapter>
constexpr bool creates = std::is_constructible_v<Adapter, const CMPIBroker*, const CMPIContext*, std::string>;

}  // namespace KO::LeaseWarrantyProvider::AdapterContract
