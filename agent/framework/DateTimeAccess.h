#pragma once

#include "KO/DateTime.h"

#include <string>

namespace KO {

/** The way of the framework's other classes to what a DateTime holds. */
class DateTimeAccess {
public:
    /** The CIM datetime text of a date; empty for no date. */
    static std::string text(const DateTime& date);

    /** The date that a CIM datetime text tells; no date when it is no point in time. */
    static DateTime fromText(const std::string& text);
};

}  // namespace KO
