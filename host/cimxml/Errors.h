#pragma once

#include <stdexcept>
#include <string>
#include <utility>

#include "model/Status.h"

namespace cimhost::cimxml {

constexpr unsigned notImplemented = 501;  ///< HTTP status of requests that this server does not support

/** Reports that an operation fails with a CIM status. */
class CimError : public std::runtime_error {
public:
    CimError(int itsCode, const std::string& message) : std::runtime_error(message), code(itsCode) {}
    explicit CimError(const Status& status) : CimError(status.rc, status.message) {}

    int code;
};

/** Refuses a request before its operation is known, with an HTTP status and a value for the header CIMError. */
class RequestRefused : public std::runtime_error {
public:
    RequestRefused(unsigned status, std::string error, const std::string& message)
        : std::runtime_error(message), httpStatus(status), cimError(std::move(error)) {}

    unsigned httpStatus;
    std::string cimError;  ///< empty: no header CIMError
};

}  // namespace cimhost::cimxml
