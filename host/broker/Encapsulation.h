#pragma once

#include "broker/Arena.h"
#include "broker/Broker.h"
#include "broker/ErrorTranslation.h"

namespace cimhost {

/** Where an object goes that is made from another one: it belongs to the request that asks for it. */
inline Arena& arenaFor(const Object& source) {
    Arena* ofThread = Broker::arenaOfThread();
    return ofThread == nullptr ? source.arena() : *ofThread;
}

/** The release function of every encapsulated type. What is left of a clone ends with the request. */
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

/** The clone function of every encapsulated type: an independent copy that lives until its release, and as long as the
 *  broker at most. */
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
