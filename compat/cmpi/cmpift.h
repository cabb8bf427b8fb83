/*
 * CMPI 2.0 function tables: the functions that a provider can call and those that it implements.
 *
 * Every object is a pair of a private handle, which belongs to the object's creator, and a pointer to a function table.
 * Slots, order and signatures are those of the CMPI 2.0 standard. Rules for all tables:
 *
 * - The first argument is the object whose table contains the function. It must not be null.
 * - ftVersion is the version of the table; later versions only append functions. If a broker does not support a
 *   function, its pointer may be null.
 * - `rc` receives the status of the call; it may be null.
 * - A failed call returns null, 0 or a value in the null state, depending on its type.
 * - A returned object belongs to the broker and is valid until the request ends. Callers should not release it, unless
 *   documented otherwise.
 * - String and value arguments are copied; the caller keeps ownership.
 * - A property list is a null-terminated array of names; a null list means all properties.
 * - An optional string argument that does not restrict the results is null.
 * - release destroys an object early; it is meant for clones.
 * - clone makes a deep copy that outlives the request. The caller must release it.
 */
#ifndef CMPIFT_H
#define CMPIFT_H

#include "cmpi20/broker.h"
#include "cmpi20/interfaces.h"
#include "cmpi20/objects.h"
#include "cmpi20/queries.h"
#include "cmpi20/request.h"
#include "cmpidt.h"

#endif
