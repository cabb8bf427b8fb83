#pragma once

#include <cmpift.h>

#include <string>
#include <utility>

// Failures of requests, and their messages.

namespace gate {

/** Ends a request with a status. The message is for a person who can fix the cause. */
struct Failure {
    CMPIrc rc;
    std::string message;
};

/** Ends a request whose object manager is shutting down or has ended. Its broker must not be used any more. */
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

/** The same if a condition is true. */
template <class... Parts>
void failIf(bool isFailure, CMPIrc rc, const Parts&... parts) {
    if (isFailure) {
        fail(rc, parts...);
    }
}

/** Writes an error to the log and trace of the agent. If the process is out of memory, nothing is written. */
void logError(const std::string& message, const char* function = __builtin_FUNCTION(),
              const char* file = __builtin_FILE(), int line = __builtin_LINE());

/** Sets the status of a function that the gate implements for others. They may pass null. */
inline void setStatus(CMPIStatus* rc, CMPIrc code) {
    if (rc != nullptr) {
        *rc = {code, nullptr};
    }
}

/**
 * A CMPI string over characters that exist elsewhere, made without a broker and without memory. Releasing and cloning
 * it have no effect. Its handle is the characters: some object managers read a message there instead of through its
 * function table.
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
