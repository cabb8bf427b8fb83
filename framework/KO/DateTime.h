#pragma once

#include <memory>

#include "Export.h"

namespace KO {

class Utils;

/**
 * A point in time with its offset from UTC, or an unset date. KO::Utils converts it to and from the 25-character CIM
 * datetime string. Copies are independent.
 */
class KO_EXPORT DateTime {
public:
    /** Creates an unset date. */
    DateTime();

    /**
     * Creates a date from a clock time. A time outside the years 0 to 9999 yields an unset date.
     * @param seconds seconds since 1970-01-01 00:00 UTC, as returned by time()
     * @param kind 3 for local time with its offset, any other number for UTC
     */
    DateTime(long seconds, unsigned int kind);

    DateTime(const DateTime& other);
    DateTime& operator=(const DateTime& other);
    ~DateTime();

private:
    friend class Utils;
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO
