#pragma once

#include <cstdint>
#include <random>
#include <vector>

namespace cimhost::lab {

/** Pseudorandom numbers that depend only on seed and stream. */
class Random {
public:
    Random(std::uint64_t seed, std::uint64_t stream) : engine(seed * 1'000'003U + stream) {}

    /** One of 0, 1, ... limit - 1. @param limit not 0 */
    std::uint64_t below(std::uint64_t limit) { return engine() % limit; }

    bool coin() { return below(2) == 0; }

    /** True once in this many calls, on average. */
    bool oneIn(std::uint64_t times) { return below(times) == 0; }

    template <class Item>
    const Item& oneOf(const std::vector<Item>& items) {
        return items[below(items.size())];
    }

private:
    std::mt19937_64 engine;
};

}  // namespace cimhost::lab
