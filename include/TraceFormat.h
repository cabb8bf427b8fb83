#pragma once

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <cstring>
#include <limits>

/**
 * Formatting of trace lines. Each formatting function has one buffer for all its calls: a result is valid until the
 * next call to the same function. Strings are truncated at 511 bytes.
 *
 * The functions are static, so that each translation unit has separate copies and buffers.
 */
namespace KO {

/** The type of a trace line. Any other number means MT_ENTERING. */
enum MessageType : int {
    MT_ENTERING = 0,  ///< function entry
    MT_EXITING = 1,   ///< function exit
    MT_METHOD = 2,    ///< call, in one line instead of entry and exit
    MT_MESSAGE = 3,   ///< message, normally an error
};

constexpr std::size_t traceBufferSize = 512;

/**
 * Writes a string to a fixed buffer. The constructor clears the buffer. A string that is too long is truncated. Avoids
 * sprintf, since tracing is frequent.
 */
class TraceText {
public:
    explicit TraceText(char (&buffer)[traceBufferSize]) : place(buffer), end(buffer + traceBufferSize - 1) {
        std::memset(buffer, 0, traceBufferSize);
    }

    /** Appends strings and numbers. */
    template <class... Parts>
    void append(Parts... parts) {
        (appendPart(parts), ...);
    }

private:
    void appendPart(const char* text) {
        const char* shownText = text != nullptr ? text : "(null)";
        appendCharacters(shownText, std::strlen(shownText));
    }

    /** Formats the number as signed, so numbers from 2147483648 appear as negative. */
    void appendPart(unsigned int number) {
        char digits[std::numeric_limits<int>::digits10 + 2];
        const char* digitsEnd = std::to_chars(digits, digits + sizeof digits, static_cast<int>(number)).ptr;
        appendCharacters(digits, static_cast<std::size_t>(digitsEnd - digits));
    }

    void appendCharacters(const char* text, std::size_t length) {
        const std::size_t taken = std::min(length, static_cast<std::size_t>(end - place));
        std::memcpy(place, text, taken);
        place += taken;
    }

    char* place;
    char* end;
};

/** Appends the line of a function's entry, exit or call, or of a message. */
[[maybe_unused]] static void appendCall(TraceText& text, const char* function, const char* file, unsigned int line,
                                        MessageType type) {
    switch (type) {
        case MT_EXITING:
            return text.append("EXITING: ", function, "() in ", file, " [Line: ", line, "]");
        case MT_METHOD:
            return text.append("METHOD: ", function, "() was invoked in ", file, " [Line: ", line, "]");
        case MT_MESSAGE:
            return text.append("MESSAGE [File: ", file, ", Line: ", line, "]: ", function);
        default:
            return text.append("ENTERING: ", function, "() in ", file, " [Line: ", line, "]");
    }
}

/**
 * Formats the line of a function's entry, exit or call, or of a message.
 * @param function the function's plain name; for MT_MESSAGE the message instead
 */
[[maybe_unused]] static char* trace(const char* function, const char* file, unsigned int line, MessageType type) {
    static char buffer[traceBufferSize];
    TraceText text(buffer);
    appendCall(text, function, file, line, type);
    return buffer;
}

/** Formats a line like trace(), followed by a parameter list. */
[[maybe_unused]] static char* tracepara(const char* function, const char* file, unsigned int line,
                                        const char* parameters, MessageType type) {
    static char buffer[traceBufferSize];
    TraceText text(buffer);
    appendCall(text, function, file, line, type);
    text.append(",Parameters List: ", parameters);
    return buffer;
}

/** Formats the line with the value of a string variable. */
[[maybe_unused]] static char* trace(const char* name, const char* file, unsigned int line, const char* value) {
    static char buffer[traceBufferSize];
    TraceText(buffer).append("VARIABLE: '", name, "' has Value '", value, "' at line ", line, " in ", file);
    return buffer;
}

/** Formats the line with the value of a number. */
[[maybe_unused]] static char* trace(const char* name, const char* file, unsigned int line, unsigned int value) {
    static char buffer[traceBufferSize];
    TraceText(buffer).append("VARIABLE: '", name, "' has Value '", value, "' at line ", line, " in ", file);
    return buffer;
}

}  // namespace KO
