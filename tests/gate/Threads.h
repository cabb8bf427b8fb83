#pragma once

#include <condition_variable>
#include <mutex>
#include <thread>
#include <vector>

namespace gatetest {

constexpr int clientCount = 32;

/** Runs a function on `count` threads, which start it together. */
template <class Body>
void onThreads(int count, Body body) {
    std::mutex mutex;
    std::condition_variable changed;
    int arrived = 0;
    std::vector<std::thread> threads;
    for (int number = 0; number < count; ++number) {
        threads.emplace_back([&, number] {
            {
                std::unique_lock<std::mutex> lock(mutex);
                ++arrived;
                changed.notify_all();
                changed.wait(lock, [&] { return arrived == count; });
            }
            body(number);
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
}

}  // namespace gatetest
