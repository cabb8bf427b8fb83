#pragma once

#include "Export.h"

#include <string>

namespace KO {

/**
 * Conversions between the framework's wide texts and the narrow ones of CIM values and paths.
 *
 * Narrow text is UTF-8; wide text holds one Unicode code point an element. A narrow byte that is
 * not part of valid UTF-8 is carried through the wide form unchanged, so that narrow to wide to
 * narrow gives back the same bytes. None of them throws but for want of memory.
 */

/** The narrow form of a wide text. A code point that UTF-8 cannot encode becomes U+FFFD. */
KO_EXPORT std::string make_string(const std::wstring& text);

/** A copy of a narrow text, usable as a file path. A null pointer gives the empty text. */
KO_EXPORT std::string make_string(const char* text);

/** The wide form of a narrow text. */
KO_EXPORT std::wstring make_wstring(const std::string& text);

}  // namespace KO
