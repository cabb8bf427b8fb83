#pragma once

#include "Export.h"

#include <memory>

namespace KO {

class DateTimeAccess;

/**
 * A point in time with its offset from UTC, or no date at all. Its text is the 25-character CIM
 * datetime, made and read by KO::Utils. Copies are independent.
 */
class KO_EXPORT DateTime {
public:
    /** No date. */
    DateTime();

    /**
     * A date from the clock. A moment outside of the years 0 to 9999 is no date.
     * @param seconds seconds since 1970-01-01 00:00 UTC, as time() gives them
     * @param kind    the form to be shown: 3 is local time with its offset, anything else UTC
     */
    DateTime(long seconds, unsigned int kind);

    DateTime(const DateTime& other);
    DateTime& operator=(const DateTime& other);
    ~DateTime();

private:
    friend class DateTimeAccess;
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
