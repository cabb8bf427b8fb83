#pragma once

#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <mutex>

namespace cimhost::server {

/** Limits the number of requests that run at the same time. */
class RequestSlots {
public:
    explicit RequestSlots(std::size_t count) : available(count) {}

    /** One slot, held until it is destroyed. */
    class Held {
    public:
        Held(RequestSlots& itsSlots, std::chrono::milliseconds patience)
            : slots(itsSlots), acquired(slots.acquire(patience)) {}
        ~Held() {
            if (acquired) {
                slots.release();
            }
        }
        Held(const Held&) = delete;
        Held& operator=(const Held&) = delete;

        /** Whether the slot became available in time. */
        explicit operator bool() const { return acquired; }

    private:
        RequestSlots& slots;
        bool acquired;
    };

private:
    bool acquire(std::chrono::milliseconds patience) {
        std::unique_lock<std::mutex> lock(mutex);
        if (!released.wait_for(lock, patience, [&] { return available > 0; })) {
            return false;
        }
        --available;
        return true;
    }

    void release() {
        {
            const std::lock_guard<std::mutex> lock(mutex);
            ++available;
        }
        released.notify_one();
    }

    std::mutex mutex;
    std::condition_variable released;
    std::size_t available;
};

}  // namespace cimhost::server
