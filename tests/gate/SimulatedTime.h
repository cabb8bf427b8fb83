#pragma once

#include <atomic>

namespace gatetest {

/** Lets sleeping threads continue at once during its lifetime, while the clock advances by the time of their sleep. */
struct SimulatedTime {
    static inline std::atomic<int> count{0};
    static inline std::atomic<long long> nanoseconds{0};  ///< that the clock is ahead; never decreases

    SimulatedTime() { ++count; }
    ~SimulatedTime() { --count; }
    SimulatedTime(const SimulatedTime&) = delete;
    SimulatedTime& operator=(const SimulatedTime&) = delete;
};

}  // namespace gatetest
