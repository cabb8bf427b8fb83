#pragma once

#include "Request.h"

#include <cstddef>

namespace KO::LeaseWarrantyProvider {

/** The operations that are dispatched by class, in the order of the dispatch table's columns. */
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

/** What an operation does for a class: drives the class's adapter, or sets the request's status. */
using Body = void (*)(Request&);

/** The body of an operation for a class id; that of an invalid class where the class is not served. */
Body bodyOf(Operation operation, unsigned short classId);

}  // namespace KO::LeaseWarrantyProvider
