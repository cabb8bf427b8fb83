#pragma once

#include <memory>
#include <ostream>
#include <string>
#include <type_traits>

#include "Export.h"

namespace RZLog {

/**
 * An output buffer for formatting consecutive messages. Belongs to one thread.
 *
 * Each message starts with a reset stream in the classic locale: formatting flags, errors and exception masks do not
 * affect the next message. Creating a buffer is cheap; use local variables.
 */
class KO_EXPORT RZMessageBuffer {
public:
    RZMessageBuffer();
    ~RZMessageBuffer();
    RZMessageBuffer(const RZMessageBuffer&) = delete;
    RZMessageBuffer& operator=(const RZMessageBuffer&) = delete;

    /** Appends a string; null appends nothing. @return the stream, for inserting more */
    std::ostream& operator<<(const char* text);

    /** Returns the stream, for inserting values of any type. Valid as long as the buffer. */
    operator std::ostream&();

    /** @name Taking the message
     * Returns the message that was inserted since the last call, and clears the buffer for the next message. The
     * argument is this buffer, or the stream that its operator<< returned.
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
 * Appends a value of any type except C strings, in its stream format: a std::string as its characters, a pointer as its
 * address, an enumeration as its number. @return the stream, for inserting more
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
