#pragma once

#include <cmpift.h>

#include <string>
#include <utility>

// Exceptions that end requests, and their messages.

namespace gate {

/** Exception that ends a request with a status. The message is for a person who can fix the cause. */
struct Failure {
    CMPIrc rc;
    std::string message;
};

/** Exception that ends a request because its object manager is ending or has ended. Do not use its broker any more. */
struct ManagerGone {
    static void throwUnless(bool mayBeUsed) {
        if (!mayBeUsed) {
            throw ManagerGone{};
        }
    }
};

/** Ends a request with a status and the message that the parts form. */
template <class... Parts>
[[noreturn]] void fail(CMPIrc rc, const Parts&... parts) {
    std::string message;
    ((message += parts), ...);
    throw Failure{rc, std::move(message)};
}

/** Calls fail() if a condition is true. */
template <class... Parts>
void failIf(bool isFailure, CMPIrc rc, const Parts&... parts) {
    if (isFailure) {
        fail(rc, parts...);
    }
}

/** Writes an error to the log and trace of the agent. Ignores exceptions of the logger. */
void logError(const std::string& message, const char* function = __builtin_FUNCTION(),
              const char* file = __builtin_FILE(), int line = __builtin_LINE());

/** Sets the status of a CMPI function that the gate implements. The pointer is null if the caller wants no status. */
inline void setStatus(CMPIStatus* rc, CMPIrc code) {
    if (rc != nullptr) {
        *rc = {code, nullptr};
    }
}

/**
 * A CMPI string that refers to existing characters. It needs no broker and allocates no memory. Releasing it has no
 * effect, and cloning it returns the same string. Its hdl member points to the characters, because some object managers
 * read a message there instead of through the function table.
 */
class StaticString {
public:
    explicit constexpr StaticString(const char* characters) : string{const_cast<char*>(characters), &functions} {}

    CMPIString* handle() { return &string; }

private:
    static inline CMPIStringFT functions{CMPIVersion200,
                                         [](CMPIString*) {
                                             return CMPIStatus{CMPI_RC_OK, nullptr};
                                         },
                                         [](const CMPIString* string, CMPIStatus* rc) {
                                             setStatus(rc, CMPI_RC_OK);
                                             return const_cast<CMPIString*>(string);
                                         },
                                         [](const CMPIString* string, CMPIStatus* rc) {
                                             setStatus(rc, CMPI_RC_OK);
                                             return static_cast<const char*>(string->hdl);
                                         }};

    CMPIString string;
};

}  // namespace gate
