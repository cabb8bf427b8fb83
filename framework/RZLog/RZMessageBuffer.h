#pragma once

#include "Export.h"

#include <memory>
#include <ostream>
#include <string>
#include <type_traits>

namespace RZLog {

/**
 * An output buffer in which one message after another is put together. It belongs to one thread.
 *
 * Its stream starts each message like a new one, with the classic locale: formatting flags, errors and
 * exception masks do not reach the next message. Making a buffer is cheap; make one where it is needed.
 */
class KO_EXPORT RZMessageBuffer {
public:
    RZMessageBuffer();
    ~RZMessageBuffer();
    RZMessageBuffer(const RZMessageBuffer&) = delete;
    RZMessageBuffer& operator=(const RZMessageBuffer&) = delete;

    /** Appends text (null appends nothing). @return the stream view, for inserting more */
    std::ostream& operator<<(const char* text);

    /** The stream view, for inserting values of any type; lives as long as the buffer. */
    operator std::ostream&();

    /** @name Taking the message
     * Gives the text accumulated since the last taking and leaves the buffer empty, ready for the
     * next message. The argument is this buffer, or the stream that its operator<< returned.
     */
    ///@{
    std::string str(RZMessageBuffer& buffer);
    std::string str(std::ostream& stream);
    ///@}

private:
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

/**
 * Appends a value that is no C string as the stream view shows it: a string as its characters, any other pointer as its
 * address. An enumeration is appended as its number. @return the stream view, for inserting more
 */
template <class Value, class = std::enable_if_t<!std::is_convertible_v<const Value&, const char*>>>
std::ostream& operator<<(RZMessageBuffer& buffer, const Value& value) {
    std::ostream& stream = buffer;
    if constexpr (std::is_enum_v<Value>) {
        return stream << +static_cast<std::underlying_type_t<Value>>(value);
    } else {
        return stream << value;
    }
}

}  // namespace RZLog
