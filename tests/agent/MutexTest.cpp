#include <gmock/gmock.h>

#include <thread>

#include "KO/Exceptions.h"
#include "KO/Mutex.h"

using KO::FrameworkException;
using KO::Mutex;

namespace {

constexpr unsigned long withoutLimit = 0xFFFFFFFF;

/** Returns whether another thread can lock the mutex without waiting. */
bool isFree(Mutex& mutex) {
    bool taken = false;
    std::thread([&mutex, &taken] {
        try {
            mutex.lock(0);
            mutex.unlock();
            taken = true;
        } catch (const FrameworkException&) {
        }
    }).join();
    return taken;
}

}  // namespace

TEST(Mutex, ExcludesOtherThreadsUntilItIsUnlocked) {
    Mutex mutex;
    EXPECT_TRUE(isFree(mutex));
    mutex.lock(withoutLimit);
    EXPECT_FALSE(isFree(mutex));
    mutex.unlock();
    EXPECT_TRUE(isFree(mutex));
}

TEST(Mutex, CanBeLockedWithATimeout) {
    Mutex mutex;
    mutex.lock(60000);
    EXPECT_FALSE(isFree(mutex));
    mutex.unlock();
    EXPECT_TRUE(isFree(mutex));
}

TEST(Mutex, ReportsATimeout) {
    Mutex mutex;
    mutex.lock(withoutLimit);
    std::string message;
    std::thread([&mutex, &message] {
        try {
            mutex.lock(1);
        } catch (const FrameworkException& failure) {
            message = failure.what();
        }
    }).join();
    EXPECT_EQ(message, "Mutex cannot be locked: Connection timed out");
    mutex.unlock();
}

TEST(Mutex, RejectsASecondLockByTheSameThread) {
    Mutex mutex;
    mutex.lock(withoutLimit);
    EXPECT_THROW(mutex.lock(withoutLimit), FrameworkException);
    EXPECT_FALSE(isFree(mutex));
    mutex.unlock();
    EXPECT_TRUE(isFree(mutex));
}

TEST(Mutex, IgnoresAnUnlockByAnotherThread) {
    Mutex mutex;
    mutex.lock(withoutLimit);
    std::thread([&mutex] { mutex.unlock(); }).join();
    EXPECT_FALSE(isFree(mutex));
    mutex.unlock();
    mutex.unlock();
    EXPECT_TRUE(isFree(mutex));
}

TEST(Mutex, AdmitsOneThreadIntoACriticalSection) {
    Mutex mutex;
    int count = 0;
    const auto work = [&mutex, &count] {
        for (int round = 0; round < 2000; ++round) {
            mutex.lock(withoutLimit);
            count = count + 1;
            mutex.unlock();
        }
    };
    std::thread one(work);
    std::thread other(work);
    one.join();
    other.join();
    EXPECT_EQ(count, 4000);
}
