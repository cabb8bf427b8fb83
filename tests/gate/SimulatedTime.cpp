#include "SimulatedTime.h"

#include <dlfcn.h>

#include <ctime>

namespace {

constexpr long long second = 1000000000;

template <class Function>
Function* systemsOwn(const char* name) {
    return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

}  // namespace

// These functions replace those of the C library, also for the libraries under test.

extern "C" __attribute__((visibility("default"))) int clock_gettime(clockid_t clock, timespec* time) noexcept {
    static auto* const real = systemsOwn<int(clockid_t, timespec*)>("clock_gettime");
    const int result = real(clock, time);
    if (clock == CLOCK_MONOTONIC) {
        const long long now = time->tv_sec * second + time->tv_nsec + gatetest::SimulatedTime::nanoseconds;
        *time = {now / second, now % second};
    }
    return result;
}

extern "C" __attribute__((visibility("default"))) int nanosleep(const timespec* duration, timespec* rest) {
    static auto* const real = systemsOwn<int(const timespec*, timespec*)>("nanosleep");
    if (gatetest::SimulatedTime::count == 0) {
        return real(duration, rest);
    }
    gatetest::SimulatedTime::nanoseconds += duration->tv_sec * second + duration->tv_nsec;
    return 0;
}
