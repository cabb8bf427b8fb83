#pragma once

#include <atomic>

namespace gatetest {

/**
 * During the lifetime of this object, calls to sleep return at once and advance the monotonic clock by their duration.
 */
struct SimulatedTime {
    static inline std::atomic<int> count{0};
    static inline std::atomic<long long> nanoseconds{0};  ///< by which the clock is ahead; never decreases

    SimulatedTime() { ++count; }
    ~SimulatedTime() { --count; }
    SimulatedTime(const SimulatedTime&) = delete;
    SimulatedTime& operator=(const SimulatedTime&) = delete;
};

}  // namespace gatetest
