#pragma once

#include <string>

#include "Export.h"

namespace KO {

/**
 * Conversions between the framework's wide strings and the narrow strings of CIM values and paths.
 *
 * Narrow strings are UTF-8; wide strings contain one Unicode code point per element. A byte that is not part of valid
 * UTF-8 is preserved, so that a conversion from narrow to wide and back returns the same bytes. The functions throw
 * only std::bad_alloc.
 */

/** Converts a wide string to a narrow one. A code point that UTF-8 cannot encode becomes U+FFFD. */
KO_EXPORT std::string make_string(const std::wstring& text);

/** Copies a narrow string. A null pointer yields the empty string. */
KO_EXPORT std::string make_string(const char* text);

/** Converts a narrow string to a wide one. */
KO_EXPORT std::wstring make_wstring(const std::string& text);

}  // namespace KO
