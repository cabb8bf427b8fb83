#pragma once

#include "KO/DateTime.h"

#include <string>

namespace KO {

/** Grants the framework's other classes access to the content of a DateTime. */
class DateTimeAccess {
public:
    /** The CIM datetime of a date; empty for no date. */
    static std::string text(const DateTime& date);

    /** The date of a CIM datetime; no date unless the string is a point in time. */
    static DateTime fromText(const std::string& text);
};

}  // namespace KO
