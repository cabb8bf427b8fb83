#pragma once

#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <mutex>

namespace cimhost::server {

/** Limits an amount that requests share, such as the number of requests at work. */
class Quota {
public:
    explicit Quota(std::size_t itsLimit) : limit(itsLimit) {}

    /** A part of the amount, held until it is destroyed. */
    class Share {
    public:
        /** Waits until the amount is available, or no other share is held: one may be larger than the limit. */
        Share(Quota& itsQuota, std::size_t itsAmount, std::chrono::milliseconds patience)
            : quota(itsQuota), amount(itsAmount), acquired(quota.acquire(amount, patience)) {}
        ~Share() {
            if (acquired) {
                quota.release(amount);
            }
        }
        Share(const Share&) = delete;
        Share& operator=(const Share&) = delete;

        /** Whether the amount became available in time. */
        explicit operator bool() const { return acquired; }

    private:
        Quota& quota;
        std::size_t amount;
        bool acquired;
    };

    /** Whether a request waits for its share. */
    bool isAwaited() const {
        const std::lock_guard<std::mutex> lock(mutex);
        return waiting != 0;
    }

private:
    bool acquire(std::size_t amount, std::chrono::milliseconds patience) {
        std::unique_lock<std::mutex> lock(mutex);
        ++waiting;
        const bool isAvailable = released.wait_for(lock, patience, [&] { return held == 0 || held + amount <= limit; });
        --waiting;
        held += isAvailable ? amount : 0;
        if (isAvailable && waiting != 0 && held < limit) {
            released.notify_one();  // a release notifies one, but may be enough for several
        }
        return isAvailable;
    }

    void release(std::size_t amount) {
        {
            const std::lock_guard<std::mutex> lock(mutex);
            held -= amount;
        }
        released.notify_one();
    }

    const std::size_t limit;
    mutable std::mutex mutex;
    std::condition_variable released;
    std::size_t held = 0;
    std::size_t waiting = 0;
};

}  // namespace cimhost::server
