#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <pthread.h>

#include <algorithm>
#include <string>
#include <thread>
#include <vector>

#include "EventLog.h"

// Tests how requests acquire the lock: order, mutual exclusion, temporary release and thread cancellation.

namespace gatetest {
namespace {

using gate::RequestLock;
using testing::ElementsAre;

/** Releases the lock temporarily, as during an up-call. */
struct ScopedRelease {
    ScopedRelease() { gate::theRequestLock.release(); }
    ~ScopedRelease() { gate::theRequestLock.reacquire(); }
    ScopedRelease(const ScopedRelease&) = delete;
    ScopedRelease& operator=(const ScopedRelease&) = delete;
};

TEST(RequestLockTest, IsPassedOnInOrderOfArrival) {
    RequestLock lock;
    EventLog log;
    std::vector<std::thread> threads;
    lock.acquire();
    for (std::size_t number = 0; number < 8; ++number) {
        threads.emplace_back([&, number] {
            lock.acquire();
            log.note(std::to_string(number));
            lock.release();
        });
        awaitQueue(lock, number + 1);
    }
    lock.release();
    join(threads);
    EXPECT_THAT(log.all(), ElementsAre("0", "1", "2", "3", "4", "5", "6", "7"));
}

TEST(RequestLockTest, ANewcomerDoesNotOvertakeAWaiter) {
    RequestLock lock;
    EventLog log;
    lock.acquire();
    std::thread other([&] {
        lock.acquire();
        log.note("waiter");
        lock.release();
    });
    awaitQueue(lock, 1);
    lock.release();
    lock.acquire();
    log.note("newcomer");
    lock.release();
    other.join();
    EXPECT_THAT(log.all(), ElementsAre("waiter", "newcomer"));
}

TEST(RequestLockTest, IsHeldByAtMostOneThread) {
    RequestLock lock;
    int inside = 0;
    int most = 0;
    int total = 0;
    std::vector<std::thread> threads;
    for (int number = 0; number < 16; ++number) {
        threads.emplace_back([&] {
            for (int round = 0; round < 500; ++round) {
                lock.acquire();
                most = std::max(most, ++inside);
                ++total;
                --inside;
                lock.release();
            }
        });
    }
    join(threads);
    EXPECT_EQ(most, 1);
    EXPECT_EQ(total, 16 * 500);
}

TEST(RequestLockTest, CanBeAcquiredByTheSameAndOtherThreadsWhileReleased) {
    EventLog log;
    const gate::LockGuard guard;
    log.note("first holds it");
    {
        const ScopedRelease released;
        {
            const gate::LockGuard again;
            log.note("same thread");
        }
        std::thread([&] {
            const gate::LockGuard other;
            log.note("other thread");
        }).join();
    }
    log.note("first again");
    EXPECT_THAT(log.all(), ElementsAre("first holds it", "same thread", "other thread", "first again"));
}

TEST(RequestLockTest, ReacquiringWaitsForTheHolder) {
    EventLog log;
    std::thread first;
    {
        const gate::LockGuard guard;
        first = std::thread([&] {
            const gate::LockGuard own;
            {
                const ScopedRelease released;
                log.note("released");
                log.await("other in");
            }
            log.note("again");
        });
        awaitQueue(gate::theRequestLock, 1);
    }
    log.await("released");
    {
        const gate::LockGuard guard;
        log.note("other in");
        awaitQueue(gate::theRequestLock, 1);
        log.note("other out");
    }
    first.join();
    EXPECT_THAT(log.all(), ElementsAre("released", "other in", "other out", "again"));
}

/** Acquires the lock, and can be cancelled after releasing it. */
void* acquireOnce(void* log) {
    {
        const gate::LockGuard guard;
        pthread_testcancel();
        static_cast<EventLog*>(log)->note("inside");
    }
    pthread_testcancel();
    return nullptr;
}

TEST(RequestLockTest, ACancelledThreadEndsAfterItHasReleasedTheLock) {
    EventLog log;
    pthread_t thread{};
    {
        const gate::LockGuard guard;
        ASSERT_EQ(pthread_create(&thread, nullptr, &acquireOnce, &log), 0);
        awaitQueue(gate::theRequestLock, 1);
        pthread_cancel(thread);
    }
    void* result = nullptr;
    ASSERT_EQ(pthread_join(thread, &result), 0);
    EXPECT_EQ(result, PTHREAD_CANCELED);
    EXPECT_THAT(log.all(), ElementsAre("inside"));
    const gate::LockGuard next;
    EXPECT_EQ(gate::theRequestLock.waiting(), 0U) << "the lock was released";
}

}  // namespace
}  // namespace gatetest
