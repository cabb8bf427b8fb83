#pragma once

#include <cmpift.h>

#include <cstdarg>

namespace cimhost {

/** @name Messages with inserts
 * The template with $0 to $9 replaced by the inserts, which come as count pairs of a CMPIType and a value: sint32,
 * uint32, sint64, uint64, real64, boolean, chars or string. There are no translations, so the default template is
 * always used. With a status other than OK the answer is the template as it stands.
 */
///@{
CMPIString* getMessage(const CMPIBroker* broker, const char* id, const char* defaultTemplate, CMPIStatus* rc,
                       CMPICount count, ...);
CMPIString* getMessage2(const CMPIBroker* broker, const char* id, CMPIMsgFileHandle file, const char* defaultTemplate,
                        CMPIStatus* rc, CMPICount count, ...);

/** Both of them, with the inserts as a list. */
CMPIString* messageFromList(const CMPIBroker* broker, const char* defaultTemplate, CMPIStatus* rc, CMPICount count,
                            va_list inserts);
///@}

}  // namespace cimhost
