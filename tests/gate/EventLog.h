#pragma once

#include <algorithm>
#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "gate/session/RequestLock.h"

// Helpers of the tests of the request lock.

namespace gatetest {

/** Events in order of occurrence. A thread can wait for an event. */
class EventLog {
public:
    void note(const std::string& event) {
        const std::lock_guard<std::mutex> lock(mutex);
        events.push_back(event);
        changed.notify_all();
    }

    void await(const std::string& event) {
        std::unique_lock<std::mutex> lock(mutex);
        changed.wait(lock, [&] { return std::find(events.begin(), events.end(), event) != events.end(); });
    }

    std::vector<std::string> all() {
        const std::lock_guard<std::mutex> lock(mutex);
        return events;
    }

private:
    std::mutex mutex;
    std::condition_variable changed;
    std::vector<std::string> events;
};

/** A timeout that no test reaches. */
constexpr std::chrono::hours longEnough{1};

/** Waits until `length` threads wait for the lock. */
inline void awaitQueue(const gate::RequestLock& lock, std::size_t length) {
    while (lock.waiting() < length) {
        std::this_thread::yield();
    }
}

inline void join(std::vector<std::thread>& threads) {
    for (std::thread& thread : threads) {
        thread.join();
    }
}

}  // namespace gatetest
