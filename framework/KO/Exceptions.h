#pragma once

#include "Export.h"

#include <exception>
#include <string>

namespace KO {

/**
 * Declares an exception with an English message.
 *
 * The exceptions are thrown by value and caught by reference, across the borders of the provider, the framework and
 * the logging library. Their visibility is therefore the default one.
 */
#define KO_EXCEPTION_CLASS(Name)                                               \
    class KO_EXPORT Name : public std::exception {                             \
    public:                                                                    \
        explicit Name(const char* text) : message(text) {}                     \
        Name(const Name&) = default;                                           \
        Name& operator=(const Name&) = default;                                \
        ~Name() override = default;                                            \
                                                                               \
        /** The message. Valid as long as the exception. */                    \
        const char* what() const noexcept override { return message.c_str(); } \
                                                                               \
    private:                                                                   \
        std::string message;                                                   \
    }

/** A record or a node of the managed system is missing, or has no such property. */
KO_EXCEPTION_CLASS(InstrumentationException);

/** An operation of the agent framework failed, or its argument is not usable. */
KO_EXCEPTION_CLASS(FrameworkException);

/** The object manager did not return what the provider needs. */
KO_EXCEPTION_CLASS(ProviderException);

#undef KO_EXCEPTION_CLASS

}  // namespace KO
