#pragma once

#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <mutex>
#include <thread>

namespace cimhost::server {

/** Limits an amount that requests share, such as the number of running requests. */
class Quota {
public:
    explicit Quota(std::size_t itsLimit) : limit(itsLimit) {}

    using Time = std::chrono::steady_clock::time_point;

    /** Holds a part of the amount until the share is destroyed. Initially empty. */
    class Share {
    public:
        Share() = default;
        ~Share() { resize(0); }
        Share(const Share&) = delete;
        Share& operator=(const Share&) = delete;

        /** Waits until a share of one is available, and takes it. @return false if it is not available in time */
        bool take(Quota& from, Time latest) {
            if (from.acquire(latest)) {
                quota = &from;
                amount = 1;
            }
            return quota != nullptr;
        }

        /** Changes the amount without waiting, even beyond the limit. Does not change a share that was not taken. */
        void resize(std::size_t size) {
            if (quota != nullptr) {
                quota->change(amount, size);
                amount = size;
            }
        }

    private:
        Quota* quota = nullptr;
        std::size_t amount = 0;
    };

    /** Whether a request waits for its share. */
    bool isAwaited() const {
        const std::lock_guard<std::mutex> lock(mutex);
        return waiting != 0;
    }

private:
    bool acquire(Time latest) {
        std::unique_lock<std::mutex> lock(mutex);
        for (int left = yields; left > 0 && held >= limit; --left) {
            lock.unlock();
            std::this_thread::yield();
            lock.lock();
        }
        ++waiting;
        const bool isAvailable = released.wait_until(lock, latest, [&] { return held < limit; });
        --waiting;
        held += isAvailable ? 1 : 0;
        if (isAvailable && waiting != 0 && held < limit) {
            released.notify_one();  // a release notifies one thread, but may suffice for several
        }
        return isAvailable;
    }

    void change(std::size_t amount, std::size_t size) {
        {
            const std::lock_guard<std::mutex> lock(mutex);
            held = held - amount + size;
        }
        released.notify_one();
    }

    static constexpr int yields = 2;  ///< before a thread sleeps, since waking it takes longer than most requests
    const std::size_t limit;
    mutable std::mutex mutex;
    std::condition_variable released;
    std::size_t held = 0;
    std::size_t waiting = 0;
};

}  // namespace cimhost::server
