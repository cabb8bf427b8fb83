#pragma once

#include <cmpift.h>

namespace gate {

/**
 * A status' message that takes neither broker nor memory: for when one of them is gone. It is valid while the library
 * is loaded. Its handle is its characters: some object managers read a message there instead of through its table.
 */
class FixedMessage {
public:
    /** @param text stays where it is */
    explicit constexpr FixedMessage(const char* text) : string{const_cast<char*>(text), &functions} {}

    CMPIString* handle() { return &string; }

private:
    static CMPIStringFT functions;

    CMPIString string;
};

}  // namespace gate
