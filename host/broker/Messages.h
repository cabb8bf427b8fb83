#pragma once

#include <cmpift.h>

#include <cstdarg>

namespace cimhost {

/** @name Messages with arguments
 * Return the default template with $0 to $9 replaced by the arguments. There are no translations.
 *
 * The arguments are count pairs of a CMPIType and a value of type sint32, uint32, sint64, uint64, real64, boolean,
 * chars or string. After an error, the functions return the template without replacements.
 */
///@{
CMPIString* getMessage(const CMPIBroker* broker, const char* id, const char* defaultTemplate, CMPIStatus* rc,
                       CMPICount count, ...);
CMPIString* getMessage2(const CMPIBroker* broker, const char* id, CMPIMsgFileHandle file, const char* defaultTemplate,
                        CMPIStatus* rc, CMPICount count, ...);

/** Implements both functions. */
CMPIString* messageFromList(const CMPIBroker* broker, const char* defaultTemplate, CMPIStatus* rc, CMPICount count,
                            va_list arguments);
///@}

}  // namespace cimhost
