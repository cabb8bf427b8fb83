#pragma once

#include <cstddef>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>

/**
 * The function that each fuzzer defines. It runs the code with one input and checks its invariants.
 * @return 0, or -1 for an input that must not be added to the corpus
 * @throws fuzz::Violation if an invariant does not hold
 */
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace fuzz {

/** An invariant does not hold. The exception ends the fuzzer, which saves the input. */
class Violation : public std::logic_error {
public:
    using std::logic_error::logic_error;
};

/** @throws Violation if the condition is false */
inline void require(bool holds, const std::string& what) {
    if (!holds) {
        throw Violation(what);
    }
}

/** @throws Violation if the values differ. The message contains the values if they are strings or numbers. */
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

/** The input as a string. */
inline std::string_view inputOf(const std::uint8_t* data, std::size_t size) {
    return {reinterpret_cast<const char*>(data), size};
}

}  // namespace fuzz
