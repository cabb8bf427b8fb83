/*
 * CMPI 2.0 function tables: everything a provider can call, and everything it has to offer.
 *
 * Every object of the interface is a pair of a private handle, which belongs to whoever made the
 * object, and a pointer to a table of functions. Slots, order and signatures are those of the
 * CMPI 2.0 standard. What holds for all tables and is not repeated at each function:
 *
 * - The first argument is the object that the function was taken from. It must not be null.
 * - ftVersion tells which version of the table this is; later versions only add functions at its
 *   end. Where a broker does not support a function, its pointer may be null.
 * - `rc` receives how the call ended; null when the caller does not want to know.
 * - When a call fails, it answers null, 0 or a value in the state null, whichever its type allows.
 * - What a call answers belongs to the broker and lives until the request ends. Nobody has to, and
 *   a provider should not, release it. Exceptions say so.
 * - Text and values handed in are copied; the caller keeps them.
 * - A property list is an array of names ended by a null pointer; a null list means all properties.
 * - An optional text that does not restrict anything is null.
 * - release ends the life of an object early; it is meant for objects that clone made.
 * - clone copies an object with all it contains. The copy outlives the request: whoever asked for
 *   it has to release it.
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
