#pragma once

#include <cstddef>
#include <cstdint>

namespace fuzz {

/** Derives decisions from the bytes of an input. After its end, each byte is 0. */
class Bytes {
public:
    Bytes(const std::uint8_t* data, std::size_t size) : next(data), end(data + size) {}

    bool isAtEnd() const { return next == end; }

    std::uint8_t byte() { return isAtEnd() ? std::uint8_t{0} : *next++; }

    /** A number below the limit. @param limit at most 256 */
    std::size_t below(std::size_t limit) { return byte() % limit; }

    /** One of the elements. */
    template <class Elements>
    const auto& pick(const Elements& elements) {
        return elements[below(elements.size())];
    }

private:
    const std::uint8_t* next;
    const std::uint8_t* end;
};

}  // namespace fuzz
