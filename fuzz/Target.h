#pragma once

#include <cstddef>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>

/**
 * What every fuzzer defines: takes one input through the code and looks whether what must hold does.
 * @return 0, or -1 for an input that is not worth keeping
 * @throws fuzz::Violation when the input shows that something does not hold
 */
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace fuzz {

/** Something that must hold does not. Leaving the fuzzer, it ends the run and has the input kept. */
class Violation : public std::logic_error {
public:
    using std::logic_error::logic_error;
};

/** @throws Violation unless it holds */
inline void require(bool holds, const std::string& what) {
    if (!holds) {
        throw Violation(what);
    }
}

/** @throws Violation unless both are the same; both can be written to a string by +=, or compared as they are */
template <class Value>
void requireSame(const Value& found, const Value& expected, const std::string& what) {
    if (found == expected) {
        return;
    }
    if constexpr (std::is_convertible_v<Value, std::string>) {
        throw Violation(what + "\nfound:    " + found + "\nexpected: " + expected);
    } else if constexpr (std::is_arithmetic_v<Value>) {
        throw Violation(what + "\nfound:    " + std::to_string(found) + "\nexpected: " + std::to_string(expected));
    } else {
        throw Violation(what);
    }
}

/** The input as text, which it often is. */
inline std::string_view textOf(const std::uint8_t* data, std::size_t size) {
    return {reinterpret_cast<const char*>(data), size};
}

}  // namespace fuzz
