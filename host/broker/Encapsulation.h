#pragma once

#include "broker/Arena.h"
#include "broker/Boundary.h"

namespace cimhost {

/** The release function of every encapsulated type. */
template <class Handle>
CMPIStatus releaseObject(Handle* handle) {
    return guarded([&] { self(handle).release(); });
}

/** The clone function of every encapsulated type: an independent copy that lives until its release or the end of the
 *  request. */
template <class Handle>
Handle* cloneObject(const Handle* handle, CMPIStatus* rc) {
    return guarded<Handle*>(rc, nullptr, [&] {
        Encapsulated<Handle>& original = self(handle);
        Handle* copy = original.arena().template make<Handle>(*original.content);
        objectOf(copy)->isClone = true;
        return copy;
    });
}

}  // namespace cimhost
