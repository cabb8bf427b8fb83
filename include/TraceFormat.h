#pragma once

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <cstring>
#include <limits>

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

/**
 * A text in a buffer of its own size, which is cleared first and cut where the buffer ends. Lines are made
 * in great numbers, hence without sprintf.
 */
class TraceText {
public:
    explicit TraceText(char (&buffer)[traceBufferSize]) : place(buffer), end(buffer + traceBufferSize - 1) {
        std::memset(buffer, 0, traceBufferSize);
    }

    void append(const char* text) {
        const char* shownText = text != nullptr ? text : "(null)";
        append(shownText, std::strlen(shownText));
    }

    /** A number counts as signed, so the highest ones are shown as negative. */
    void append(unsigned int number) {
        char digits[std::numeric_limits<int>::digits10 + 2];
        append(digits, static_cast<std::size_t>(
                           std::to_chars(digits, digits + sizeof digits, static_cast<int>(number)).ptr - digits));
    }

private:
    void append(const char* text, std::size_t length) {
        const std::size_t taken = std::min(length, static_cast<std::size_t>(end - place));
        std::memcpy(place, text, taken);
        place += taken;
    }

    char* place;
    char* end;
};

/** Puts texts and numbers together in the buffer. @return the buffer */
template <class... Parts>
static char* formatTrace(char (&buffer)[traceBufferSize], Parts... parts) {
    TraceText text(buffer);
    (text.append(parts), ...);
    return buffer;
}

/**
 * The line of a function's entry, exit or call, or of a message.
 * @param function the function's plain name; for MT_MESSAGE the message text instead
 */
[[maybe_unused]] static char* trace(const char* function, const char* file, unsigned int line, MessageType type) {
    static char buffer[traceBufferSize];
    switch (type) {
        case MT_EXITING:
            return formatTrace(buffer, "EXITING: ", function, "() in ", file, " [Line: ", line, "]");
        case MT_METHOD:
            return formatTrace(buffer, "METHOD: ", function, "() was invoked in ", file, " [Line: ", line, "]");
        case MT_MESSAGE:
            return formatTrace(buffer, "MESSAGE [File: ", file, ", Line: ", line, "]: ", function);
        default:
            return formatTrace(buffer, "ENTERING: ", function, "() in ", file, " [Line: ", line, "]");
    }
}

/** As trace, with a parameter list at the end. */
[[maybe_unused]] static char* tracepara(const char* function, const char* file, unsigned int line,
                                        const char* parameters, MessageType type) {
    static char buffer[traceBufferSize];
    constexpr const char* lineEnd = "],Parameters List: ";
    switch (type) {
        case MT_EXITING:
            return formatTrace(buffer, "EXITING: ", function, "() in ", file, " [Line: ", line, lineEnd, parameters);
        case MT_METHOD:
            return formatTrace(buffer, "METHOD: ", function, "() was invoked in ", file, " [Line: ", line, lineEnd,
                               parameters);
        case MT_MESSAGE:
            return formatTrace(buffer, "MESSAGE [File: ", file, ", Line: ", line, "]: ", function,
                               ",Parameters List: ", parameters);
        default:
            return formatTrace(buffer, "ENTERING: ", function, "() in ", file, " [Line: ", line, lineEnd, parameters);
    }
}

/** The line that tells a text variable's value. */
[[maybe_unused]] static char* trace(const char* name, const char* file, unsigned int line, const char* value) {
    static char buffer[traceBufferSize];
    return formatTrace(buffer, "VARIABLE: '", name, "' has Value '", value, "' at line ", line, " in ", file);
}

/** The line that tells a number's value. */
[[maybe_unused]] static char* trace(const char* name, const char* file, unsigned int line, unsigned int value) {
    static char buffer[traceBufferSize];
    return formatTrace(buffer, "VARIABLE: '", name, "' has Value '", value, "' at line ", line, " in ", file);
}

}  // namespace KO
