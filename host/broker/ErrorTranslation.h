#pragma once

#include <cmpift.h>
#include <cxxabi.h>

#include <exception>
#include <string>
#include <utility>

#include "broker/Object.h"
#include "model/Status.h"

// The C boundary: inside, functions throw Failure; outside, callers see a CMPIStatus and a harmless value.

namespace cimhost {

/** Ends a table function with a status other than OK. */
class Failure {
public:
    explicit Failure(int rc, std::string message = {}) : reason{rc, std::move(message)} {}
    explicit Failure(Status status) : reason(std::move(status)) {}

    const Status& status() const { return reason; }

private:
    Status reason;
};

/** The status as C; its message, if any, is an object of the current request. Never throws. */
CMPIStatus toCmpi(const Status& status) noexcept;

/** The status that stands for the exception being handled; only in a catch block. */
Status statusOfCurrentException() noexcept;

/** Runs the body of a function that answers a status. What it throws becomes that status. */
template <class Body>
CMPIStatus guarded(Body&& body) {
    try {
        body();
        return {CMPI_RC_OK, nullptr};
    } catch (const abi::__forced_unwind&) {
        throw;  // the thread ends
    } catch (...) {
        return toCmpi(statusOfCurrentException());
    }
}

/** Runs the body of a function that answers a value. What it throws becomes *rc, unless rc is null, and failed. */
template <class Result, class Body>
Result guarded(CMPIStatus* rc, Result failed, Body&& body) {
    Result result = failed;
    const CMPIStatus status = guarded([&] { result = body(); });
    if (rc != nullptr) {
        *rc = status;
    }
    return status.rc == CMPI_RC_OK ? result : failed;
}

/** Data that says nothing, as getters answer together with a status. */
inline CMPIData badData() {
    CMPIData data{};
    data.state = CMPI_badValue;
    return data;
}

/** The object that a table function is called on. Failure with CMPI_RC_ERR_INVALID_HANDLE if it is none. */
template <class Handle>
Encapsulated<Handle>& self(const Handle* handle) {
    Encapsulated<Handle>* object = objectOf(handle);
    if (object == nullptr) {
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE);
    }
    return *object;
}

/** The content of the object that a table function is called on. */
template <class Handle>
typename Traits<Handle>::Content& content(const Handle* handle) {
    return *self(handle).content;
}

/** The content of an object given as an argument. Failure with CMPI_RC_ERR_INVALID_PARAMETER if it is none. */
template <class Handle>
typename Traits<Handle>::Content& argument(const Handle* handle) {
    Encapsulated<Handle>* object = objectOf(handle);
    if (object == nullptr) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    return *object->content;
}

/** A text given as an argument. Failure with CMPI_RC_ERR_INVALID_PARAMETER if it is null. */
std::string argument(const char* text);

}  // namespace cimhost
