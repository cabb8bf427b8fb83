#pragma once

#include <cstdarg>
#include <cstdio>
#include <cstring>

/**
 * The texts of trace lines. Each formatting function owns one buffer, shared by all its calls: a
 * result is valid until the next call of the same function. Texts are cut at 511 characters.
 *
 * The functions are static on purpose: each source unit has its own copies, and so its own buffers.
 */
namespace KO {

/** The kind of a trace line. Any other number counts as MT_ENTERING. */
enum MessageType : int {
    MT_ENTERING = 0,  ///< function entry
    MT_EXITING = 1,   ///< function exit
    MT_METHOD = 2,    ///< a call that is only noted
    MT_MESSAGE = 3,   ///< a free text, normally an error text
};

constexpr std::size_t traceBufferSize = 512;

/** Clears the buffer and formats into it. @return the buffer */
[[maybe_unused]] __attribute__((format(printf, 2, 3))) static char* formatTrace(char (&buffer)[traceBufferSize],
                                                                                const char* format, ...) {
    std::memset(buffer, 0, traceBufferSize);
    std::va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(buffer, traceBufferSize, format, arguments);
    va_end(arguments);
    return buffer;
}

/**
 * The line of a function's entry, exit or call, or of a message.
 * @param function the function's plain name; for MT_MESSAGE the message text instead
 */
[[maybe_unused]] static char* trace(const char* function, const char* file, unsigned int line, MessageType type) {
    static char buffer[traceBufferSize];
    const int lineNumber = static_cast<int>(line);
    switch (type) {
        case MT_EXITING:
            return formatTrace(buffer, "EXITING: %s() in %s [Line: %d]", function, file, lineNumber);
        case MT_METHOD:
            return formatTrace(buffer, "METHOD: %s() was invoked in %s [Line: %d]", function, file, lineNumber);
        case MT_MESSAGE:
            return formatTrace(buffer, "MESSAGE [File: %s, Line: %d]: %s", file, lineNumber, function);
        default:
            return formatTrace(buffer, "ENTERING: %s() in %s [Line: %d]", function, file, lineNumber);
    }
}

/** As trace, with a parameter list at the end. */
[[maybe_unused]] static char* tracepara(const char* function, const char* file, unsigned int line,
                                        const char* parameters, MessageType type) {
    static char buffer[traceBufferSize];
    const int lineNumber = static_cast<int>(line);
    switch (type) {
        case MT_EXITING:
            return formatTrace(buffer, "EXITING: %s() in %s [Line: %d],Parameters List: %s", function, file, lineNumber,
                               parameters);
        case MT_METHOD:
            return formatTrace(buffer, "METHOD: %s() was invoked in %s [Line: %d],Parameters List: %s", function, file,
                               lineNumber, parameters);
        case MT_MESSAGE:
            return formatTrace(buffer, "MESSAGE [File: %s, Line: %d]: %s,Parameters List: %s", file, lineNumber,
                               function, parameters);
        default:
            return formatTrace(buffer, "ENTERING: %s() in %s [Line: %d],Parameters List: %s", function, file,
                               lineNumber, parameters);
    }
}

/** The line that tells a text variable's value. */
[[maybe_unused]] static char* trace(const char* name, const char* file, unsigned int line, const char* value) {
    static char buffer[traceBufferSize];
    return formatTrace(buffer, "VARIABLE: '%s' has Value '%s' at line %d in %s", name, value, static_cast<int>(line),
                       file);
}

/** The line that tells a number's value. */
[[maybe_unused]] static char* trace(const char* name, const char* file, unsigned int line, unsigned int value) {
    static char buffer[traceBufferSize];
    return formatTrace(buffer, "VARIABLE: '%s' has Value '%d' at line %d in %s", name, static_cast<int>(value),
                       static_cast<int>(line), file);
}

}  // namespace KO
