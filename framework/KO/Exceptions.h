#pragma once

#include <exception>
#include <string>

#include "Export.h"

namespace KO {

/**
 * Declares an exception class with an English message.
 *
 * An exception can be caught in another library than the one that throws it. The classes therefore have default
 * visibility.
 */
#define KO_EXCEPTION_CLASS(Name)                                               \
    class KO_EXPORT Name : public std::exception {                             \
    public:                                                                    \
        explicit Name(const char* text) : message(text) {}                     \
        Name(const Name&) = default;                                           \
        Name& operator=(const Name&) = default;                                \
        ~Name() override = default;                                            \
                                                                               \
        /** Returns the message, which is valid as long as the exception. */   \
        const char* what() const noexcept override { return message.c_str(); } \
                                                                               \
    private:                                                                   \
        std::string message;                                                   \
    }

/** A record or a node of the managed system does not exist, or lacks a property. */
KO_EXCEPTION_CLASS(InstrumentationException);

/** An operation of the agent framework failed, or its argument is invalid. */
KO_EXCEPTION_CLASS(FrameworkException);

/** The object manager did not return a required object. */
KO_EXCEPTION_CLASS(ProviderException);

#undef KO_EXCEPTION_CLASS

}  // namespace KO
