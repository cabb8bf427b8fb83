#pragma once

#include "Export.h"
#include "KO/DateTime.h"

#include <string>

namespace KO {

class PropertyFile;

/** Reading and writing of property file entries, and the text form of dates. */
class KO_EXPORT Utils {
public:
    /**
     * The text under a key; empty when the key is absent.
     * @throws FrameworkException when the file is not open
     */
    static std::string ReadStringFromFile(PropertyFile& file, const std::string& key);

    /**
     * The date under a key; no date when the key is absent or its text is no date.
     * @throws FrameworkException when the file is not open
     */
    static DateTime ReadDateFromFile(PropertyFile& file, const std::string& key);

    /**
     * Sets the text under a key, in place if the key is there, else at the end. Any text is kept
     * exactly, line breaks included.
     * @throws FrameworkException when the file is not open for writing
     */
    static void WriteStringToFile(PropertyFile& file, const std::string& key, const std::string& value);

    /** Sets the date under a key; otherwise as WriteStringToFile. No date is written as empty text. */
    static void WriteDateToFile(PropertyFile& file, const std::string& key, const DateTime& value);

    /**
     * The CIM datetime text of a date: yyyymmddhhmmss.mmmmmmsutc, 25 characters, in the offset that
     * the date carries. No date gives "00000000000000.000000-000".
     */
    static std::string convertCIMDateTime(DateTime value);

    /**
     * The date that a CIM datetime text tells; no date when it is no valid one. An interval is no date.
     * convertCIMDateTime() gives back exactly the text that a date was made from.
     */
    static DateTime convertStringToDateTime(std::string text);
};

}  // namespace KO
