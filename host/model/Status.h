#pragma once

#include <cmpidt.h>

#include <string>

namespace cimhost {

/** A CIM status code with an optional message. It is an int: a provider can return a number that is not a CMPIrc. */
struct Status {
    int rc = CMPI_RC_OK;
    std::string message{};

    bool ok() const { return rc == CMPI_RC_OK; }
};

/** A status and, if it is OK, a value. */
template <class T>
struct StatusOr {
    Status status{};
    T value{};

    bool ok() const { return status.ok(); }
};

}  // namespace cimhost
