#include "Diary.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <pthread.h>

#include <algorithm>
#include <string>
#include <thread>
#include <vector>

// The order in which requests hold the lock.

namespace gatetest {
namespace {

using gate::RequestLock;
using testing::ElementsAre;

/** Releases the lock for a while, as for a service of the object manager. */
struct ScopedRelease {
    ScopedRelease() { gate::theRequestLock.release(); }
    ~ScopedRelease() { gate::theRequestLock.reacquire(); }
    ScopedRelease(const ScopedRelease&) = delete;
    ScopedRelease& operator=(const ScopedRelease&) = delete;
};

TEST(RequestLockTest, ItIsPassedOnInOrderOfArrival) {
    RequestLock lock;
    Diary diary;
    std::vector<std::thread> threads;
    lock.acquire();
    for (std::size_t number = 0; number < 8; ++number) {
        threads.emplace_back([&, number] {
            lock.acquire();
            diary.note(std::to_string(number));
            lock.release();
        });
        awaitQueue(lock, number + 1);
    }
    lock.release();
    join(threads);
    EXPECT_THAT(diary.all(), ElementsAre("0", "1", "2", "3", "4", "5", "6", "7"));
}

TEST(RequestLockTest, ANewcomerDoesNotOvertakeAWaiter) {
    RequestLock lock;
    Diary diary;
    lock.acquire();
    std::thread other([&] {
        lock.acquire();
        diary.note("waiter");
        lock.release();
    });
    awaitQueue(lock, 1);
    lock.release();
    lock.acquire();
    diary.note("newcomer");
    lock.release();
    other.join();
    EXPECT_THAT(diary.all(), ElementsAre("waiter", "newcomer"));
}

TEST(RequestLockTest, OneThreadHoldsItAtMost) {
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

TEST(RequestLockTest, WhileReleasedItCanBeAcquiredByTheSameAndOtherThreads) {
    Diary diary;
    const gate::LockGuard guard;
    diary.note("first holds it");
    {
        const ScopedRelease released;
        {
            const gate::LockGuard again;
            diary.note("same thread");
        }
        std::thread([&] {
            const gate::LockGuard other;
            diary.note("other thread");
        }).join();
    }
    diary.note("first again");
    EXPECT_THAT(diary.all(), ElementsAre("first holds it", "same thread", "other thread", "first again"));
}

TEST(RequestLockTest, ReacquiringWaitsForTheHolder) {
    Diary diary;
    std::thread first;
    {
        const gate::LockGuard guard;
        first = std::thread([&] {
            const gate::LockGuard own;
            {
                const ScopedRelease released;
                diary.note("released");
                diary.await("other in");
            }
            diary.note("again");
        });
        awaitQueue(gate::theRequestLock, 1);
    }
    diary.await("released");
    {
        const gate::LockGuard guard;
        diary.note("other in");
        awaitQueue(gate::theRequestLock, 1);
        diary.note("other out");
    }
    first.join();
    EXPECT_THAT(diary.all(), ElementsAre("released", "other in", "other out", "again"));
}

/** Acquires the lock, and can be cancelled after releasing it. */
void* acquireOnce(void* diary) {
    {
        const gate::LockGuard guard;
        pthread_testcancel();
        static_cast<Diary*>(diary)->note("inside");
    }
    pthread_testcancel();
    return nullptr;
}

TEST(RequestLockTest, ACancelledThreadEndsAfterItHasReleasedTheLock) {
    Diary diary;
    pthread_t thread{};
    {
        const gate::LockGuard guard;
        ASSERT_EQ(pthread_create(&thread, nullptr, &acquireOnce, &diary), 0);
        awaitQueue(gate::theRequestLock, 1);
        pthread_cancel(thread);
    }
    void* result = nullptr;
    ASSERT_EQ(pthread_join(thread, &result), 0);
    EXPECT_EQ(result, PTHREAD_CANCELED);
    EXPECT_THAT(diary.all(), ElementsAre("inside"));
    const gate::LockGuard next;
    EXPECT_EQ(gate::theRequestLock.waiting(), 0U) << "the lock was released";
}

}  // namespace
}  // namespace gatetest
