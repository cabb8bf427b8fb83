#pragma once

#include "Export.h"

#include <exception>
#include <string>

namespace KO {

/**
 * The shape that the system's exceptions share: an English message, fixed where it is thrown.
 *
 * They are thrown by value, caught by reference, and cross the borders of the provider, the
 * framework and the logging library; hence their default visibility.
 */
#define KO_EXCEPTION_CLASS(Name)                                               \
    class KO_EXPORT Name : public std::exception {                             \
    public:                                                                    \
        explicit Name(const char* text) : message(text) {}                     \
        Name(const Name&) = default;                                           \
        Name& operator=(const Name&) = default;                                \
        ~Name() override = default;                                            \
                                                                               \
        /** The message; valid as long as the exception. */                    \
        const char* what() const noexcept override { return message.c_str(); } \
                                                                               \
    private:                                                                   \
        std::string message;                                                   \
    }

/** A record or node of the managed system is missing or is asked for something it has not. */
KO_EXCEPTION_CLASS(InstrumentationException);

/** An operation of the agent framework failed, or was given what it cannot work on. */
KO_EXCEPTION_CLASS(FrameworkException);

/** The provider cannot get what it needs from the object manager. */
KO_EXCEPTION_CLASS(ProviderException);

#undef KO_EXCEPTION_CLASS

}  // namespace KO
