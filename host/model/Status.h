#pragma once

#include <cmpidt.h>

#include <string>

namespace cimhost {

/**
 * How an operation ended: a CIM status code and, where there is something to say, a text for people.
 * The code is a plain number, since a provider may answer one that is no CMPIrc.
 */
struct Status {
    int rc = CMPI_RC_OK;
    std::string message{};

    bool ok() const { return rc == CMPI_RC_OK; }
};

/** A status with what the operation gives when it is OK; the value is an empty one otherwise. */
template <class T>
struct Answer {
    Status status{};
    T value{};

    bool ok() const { return status.ok(); }
};

}  // namespace cimhost
