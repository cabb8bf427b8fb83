#pragma once

#include "broker/Arena.h"
#include "broker/Broker.h"
#include "broker/ErrorTranslation.h"

namespace cimhost {

/** The arena for an object created from another one: the current request's; outside of requests, the other object's. */
inline Arena& arenaFor(const Object& source) {
    Arena* ofThread = Broker::arenaOfThread();
    return ofThread == nullptr ? source.arena() : *ofThread;
}

/** The release function of all encapsulated types. The handle of a released clone is freed with the current request. */
template <class Handle>
CMPIStatus releaseObject(Handle* handle) {
    return guarded([&] {
        Encapsulated<Handle>& object = self(handle);
        object.release();
        if (object.isClone) {
            arenaFor(object).takeFrom(object.arena(), object);
        }
    });
}

/** The clone function of all encapsulated types. The clone is valid until its release, or until the broker is
 * destroyed.
 */
template <class Handle>
Handle* cloneObject(const Handle* handle, CMPIStatus* rc) {
    return guarded<Handle*>(rc, nullptr, [&] {
        Encapsulated<Handle>& original = self(handle);
        Handle* copy = original.arena().clones().template make<Handle>(*original.content);
        objectOf(copy)->isClone = true;
        objectOf(copy)->lacksCharacters = original.lacksCharacters;
        return copy;
    });
}

}  // namespace cimhost
