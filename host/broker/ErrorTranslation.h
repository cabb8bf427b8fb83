#pragma once

#include <cmpift.h>
#include <cxxabi.h>

#include <optional>
#include <string>
#include <utility>

#include "broker/Object.h"
#include "model/Status.h"

// Exceptions at the C boundary. The body of a table function throws Failure; the caller receives a CMPIStatus.

namespace cimhost {

/** An exception that ends a table function with a status other than OK. */
class Failure {
public:
    explicit Failure(int rc, std::string message = {}) : reason{rc, std::move(message)} {}
    explicit Failure(Status status) : reason(std::move(status)) {}

    const Status& status() const { return reason; }

private:
    Status reason;
};

/** Converts a status. Its message becomes an object of the current request; outside of requests, it is omitted. */
CMPIStatus toCmpi(const Status& status) noexcept;

/** Converts the current exception to a status. Call it in a catch block. */
Status statusOfCurrentException() noexcept;

/** Runs the body of a function that returns a status. Converts an exception to the status. */
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

/** Runs the body of a function that returns a value. After an exception, returns `failed`. @param rc status or null */
template <class Result, class Body>
Result guarded(CMPIStatus* rc, Result failed, Body&& body) {
    Result result = failed;
    const CMPIStatus status = guarded([&] { result = body(); });
    if (rc != nullptr) {
        *rc = status;
    }
    return status.rc == CMPI_RC_OK ? result : failed;
}

/** The data that getters return with an error. */
inline CMPIData badData() {
    CMPIData data{};
    data.state = CMPI_badValue;
    return data;
}

/** The object that a table function is called on. @throws Failure with CMPI_RC_ERR_INVALID_HANDLE if there is none */
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

/** The content of an argument. @throws Failure with CMPI_RC_ERR_INVALID_PARAMETER if it is not a live object */
template <class Handle>
typename Traits<Handle>::Content& argument(const Handle* handle) {
    Encapsulated<Handle>* object = objectOf(handle);
    if (object == nullptr) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    return *object->content;
}

/** An argument that must not be null. @throws Failure with CMPI_RC_ERR_INVALID_PARAMETER if it is */
inline const char* argument(const char* characters) {
    if (characters == nullptr) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    return characters;
}

/** The string of an optional argument; none if it is null. */
inline std::optional<std::string> optionalString(const char* characters) {
    return characters == nullptr ? std::nullopt : std::optional<std::string>(characters);
}

}  // namespace cimhost
