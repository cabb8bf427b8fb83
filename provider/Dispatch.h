#pragma once

#include "Request.h"

#include <cstddef>

namespace KO::LeaseWarrantyProvider {

/** Operations that are dispatched by class, in the order of the dispatch table's columns. */
enum class Operation : std::size_t {
    enumInstanceNames,
    enumInstances,
    getInstance,
    createInstance,
    modifyInstance,
    deleteInstance,
    associators,
    associatorNames,
    count,
};

/** Handler of an operation for a class. Calls the class's adapter or sets the request's status. */
using Body = void (*)(Request&);

/** Returns the handler of an operation for a class id; &Handlers::invalidClass for other classes. */
Body bodyOf(Operation operation, unsigned short classId);

}  // namespace KO::LeaseWarrantyProvider
