#pragma once

#include <string>

#include "Export.h"
#include "KO/DateTime.h"

namespace KO {

class PropertyFile;

/** Reads and writes property file entries, and converts dates to and from strings. */
class KO_EXPORT Utils {
public:
    /**
     * Returns the value of a key; empty if the key does not exist.
     * @throws FrameworkException if the file is not open
     */
    static std::string ReadStringFromFile(PropertyFile& file, const std::string& key);

    /**
     * Returns the date of a key; an unset date if the key does not exist or its value is not a date.
     * @throws FrameworkException if the file is not open
     */
    static DateTime ReadDateFromFile(PropertyFile& file, const std::string& key);

    /**
     * Sets the value of a key, in place if the key exists, otherwise at the end. Values are preserved exactly,
     * including line breaks.
     * @throws FrameworkException if the file is not open for writing
     */
    static void WriteStringToFile(PropertyFile& file, const std::string& key, const std::string& value);

    /** Sets the date of a key. Writes an unset date as an empty value. Otherwise like WriteStringToFile. */
    static void WriteDateToFile(PropertyFile& file, const std::string& key, const DateTime& value);

    /**
     * Converts a date to a CIM datetime string of 25 characters, yyyymmddhhmmss.mmmmmmsutc, with the date's offset. An
     * unset date yields "00000000000000.000000-000".
     */
    static std::string convertCIMDateTime(DateTime value);

    /**
     * Converts a CIM datetime string to a date. A string that is invalid or an interval yields an unset date.
     * convertCIMDateTime() returns the original string of a valid date.
     */
    static DateTime convertStringToDateTime(std::string text);
};

}  // namespace KO
