#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "EventLog.h"
#include "gate/session/ProviderSession.h"

// Tests the closing and reopening of the request lock.

namespace gatetest {
namespace {

using gate::RequestLock;
using testing::ElementsAre;

/** Waits until the lock is closing or closed. */
void awaitClosing(RequestLock& lock) {
    while (lock.beginRequest()) {
        lock.endRequest();
        std::this_thread::yield();
    }
}

TEST(LockClosingTest, AClosedLockAdmitsNoRequest) {
    RequestLock lock;
    EXPECT_TRUE(lock.beginRequest());
    lock.endRequest();
    EXPECT_TRUE(lock.close(longEnough));
    EXPECT_FALSE(lock.beginRequest());
    EXPECT_FALSE(lock.close(longEnough)) << "the lock was already closed";
}

TEST(LockClosingTest, ClosingWaitsForTheHolderAndTheQueue) {
    RequestLock lock;
    EventLog log;
    std::vector<std::thread> threads;
    const auto request = [&](const std::string& name) {
        lock.beginRequest();
        ASSERT_TRUE(lock.acquire());
        log.note(name + " inside");
        if (name == "first") {
            log.await("go on");
        }
        log.note(name + " done");
        lock.release();
        lock.endRequest();
    };
    threads.emplace_back(request, "first");
    log.await("first inside");
    threads.emplace_back(request, "second");
    awaitQueue(lock, 1);
    threads.emplace_back([&] {
        lock.close(longEnough);
        log.note("closed");
    });
    awaitClosing(lock);
    EXPECT_THAT(log.all(), ElementsAre("first inside"));
    log.note("go on");
    join(threads);
    EXPECT_THAT(log.all(),
                ElementsAre("first inside", "go on", "first done", "second inside", "second done", "closed"));
}

TEST(LockClosingTest, AfterTheTimeoutClosingWaitsOnlyForTheHolder) {
    RequestLock lock;
    EventLog log;
    lock.beginRequest();
    ASSERT_TRUE(lock.acquire());
    std::thread closer([&] {
        lock.close(std::chrono::seconds(0));
        log.note("closed");
    });
    awaitClosing(lock);
    log.note("releasing");
    lock.release();
    closer.join();
    EXPECT_THAT(log.all(), ElementsAre("releasing", "closed")) << "the lock is closed before the request ends";
    lock.endRequest();
}

TEST(LockClosingTest, AClosingLockCannotBeAcquired) {
    RequestLock lock;
    ASSERT_TRUE(lock.beginRequest());
    std::thread closer([&] { EXPECT_TRUE(lock.close(longEnough)); });
    awaitClosing(lock);
    EXPECT_FALSE(lock.acquire());
    lock.endRequest();
    closer.join();
}

TEST(LockClosingTest, AClosingLockCanBeReacquired) {
    RequestLock lock;
    ASSERT_TRUE(lock.beginRequest());
    ASSERT_TRUE(lock.acquire());
    lock.release();
    std::thread closer([&] { EXPECT_TRUE(lock.close(longEnough)); });
    awaitClosing(lock);
    lock.reacquire();
    lock.release();
    lock.endRequest();
    closer.join();
}

TEST(LockClosingTest, ReacquiringAClosedLockWaitsUntilItIsOpened) {
    RequestLock lock;
    EventLog log;
    std::thread late([&] {
        lock.beginRequest();
        EXPECT_TRUE(lock.acquire());
        lock.release();
        log.note("released");
        log.await("shut");
        lock.reacquire();
        log.note("again");
        lock.release();
        lock.endRequest();
    });
    log.await("released");
    EXPECT_TRUE(lock.close(std::chrono::seconds(0)));
    log.note("shut");
    awaitQueue(lock, 1);
    log.note("opened");
    lock.open();
    late.join();
    EXPECT_THAT(log.all(), ElementsAre("released", "shut", "opened", "again"));
    EXPECT_TRUE(lock.beginRequest());
    lock.endRequest();
}

TEST(LockClosingTest, ReacquiringInAGenerationFailsAfterTheLockWasClosed) {
    RequestLock lock;
    ASSERT_TRUE(lock.beginRequest());
    ASSERT_TRUE(lock.acquire());
    lock.release();
    const std::size_t generation = lock.generation();
    EXPECT_TRUE(lock.reacquire(generation));
    lock.release();
    lock.endRequest();
    EXPECT_TRUE(lock.close(longEnough));
    EXPECT_FALSE(lock.reacquire(generation));
    EXPECT_TRUE(lock.open());
    EXPECT_NE(lock.generation(), generation);
    EXPECT_FALSE(lock.reacquire(generation)) << "the object manager of this generation has ended";
    EXPECT_TRUE(lock.acquire()) << "the failed call does not acquire the lock";
    lock.release();
}

TEST(LockClosingTest, ClosingRefusesOnlyWaitersThatRequireItsGeneration) {
    RequestLock lock;
    EventLog log;
    std::vector<std::thread> threads;
    const auto request = [&](const std::string& name, const std::function<bool()>& reacquire) {
        lock.beginRequest();
        EXPECT_TRUE(lock.acquire());
        lock.release();
        log.note(name + " released");
        log.await("ending");
        log.note(name + (reacquire() ? " again" : " refused"));
        lock.endRequest();
    };
    threads.emplace_back(request, "first", [&] { return lock.reacquire(0); });
    threads.emplace_back(request, "second", [&] {
        lock.reacquire();
        lock.release();
        return true;
    });
    log.await("first released");
    log.await("second released");
    EXPECT_TRUE(lock.close(std::chrono::seconds(0), RequestLock::Closing::temporary, [&] {
        log.note("ending");
        awaitQueue(lock, 2);
    }));
    log.await("first refused");
    EXPECT_EQ(lock.waiting(), 1U);
    log.note("opened");
    EXPECT_TRUE(lock.open());
    join(threads);
    EXPECT_EQ(log.all().back(), "second again");
}

TEST(LockClosingTest, TheShutdownCallbackRunsWithTheLockHeldBeforeTheLockIsClosed) {
    RequestLock lock;
    EventLog log;
    std::thread released([&] {
        lock.beginRequest();
        EXPECT_TRUE(lock.acquire());
        lock.release();
        log.note("released");
        log.await("ending");
        lock.reacquire();
        log.note("again");
        lock.release();
        lock.endRequest();
    });
    log.await("released");
    EXPECT_TRUE(lock.close(std::chrono::seconds(0), RequestLock::Closing::temporary, [&] {
        log.note("ending");
        awaitQueue(lock, 1);
        EXPECT_FALSE(lock.open()) << "the lock is closing";
        EXPECT_FALSE(lock.acquire());
        log.note("ended");
    }));
    log.note("opened");
    EXPECT_TRUE(lock.open());
    released.join();
    EXPECT_THAT(log.all(), ElementsAre("released", "ending", "ended", "opened", "again"));
}

TEST(LockClosingTest, AWaitingCloserDoesNotCloseALockThatWasReopenedMeanwhile) {
    RequestLock lock;
    ASSERT_TRUE(lock.beginRequest());
    std::atomic<int> ends{0};
    std::vector<std::thread> threads;
    for (int number = 0; number < 4; ++number) {
        threads.emplace_back([&] { lock.close(longEnough, RequestLock::Closing::temporary, [&] { ++ends; }); });
    }
    while (lock.closing() < 4) {
        std::this_thread::yield();
    }
    lock.endRequest();
    while (!lock.open()) {
        std::this_thread::yield();
    }
    join(threads);
    EXPECT_EQ(ends, 1);
    EXPECT_TRUE(lock.beginRequest());
    lock.endRequest();
}

TEST(LockClosingTest, RequestsOfOtherThreadsAreReported) {
    RequestLock lock;
    EXPECT_FALSE(lock.hasOtherRequests());
    lock.beginRequest();
    EXPECT_FALSE(lock.hasOtherRequests()) << "the request is on this thread";
    std::thread([&] {
        EXPECT_TRUE(lock.hasOtherRequests());
        lock.beginRequest();
    }).join();
    EXPECT_TRUE(lock.hasOtherRequests());
    lock.endRequest();
}

TEST(LockClosingTest, ARefusedRequestDoesNotCount) {
    RequestLock lock;
    EXPECT_TRUE(lock.close(longEnough));
    std::thread([&] { EXPECT_FALSE(lock.beginRequest()); }).join();
    EXPECT_FALSE(lock.hasOtherRequests());
}

TEST(LockClosingTest, APermanentlyClosedLockCannotBeOpened) {
    RequestLock lock;
    lock.close(longEnough);
    lock.close(longEnough, RequestLock::Closing::permanent);
    EXPECT_FALSE(lock.open());
    EXPECT_FALSE(lock.beginRequest());
}

TEST(LockClosingTest, OneOfSeveralConcurrentCallsClosesTheLock) {
    RequestLock lock;
    std::atomic<int> closedBy{0};
    ASSERT_TRUE(lock.beginRequest());
    std::vector<std::thread> threads;
    for (int number = 0; number < 4; ++number) {
        threads.emplace_back([&] { closedBy += lock.close(longEnough) ? 1 : 0; });
    }
    awaitClosing(lock);
    lock.endRequest();
    join(threads);
    EXPECT_EQ(closedBy, 1);
}

TEST(LockClosingTest, ClosingDoesNotWaitForARequestOfTheCallingThread) {
    RequestLock lock;
    ASSERT_TRUE(lock.beginRequest());
    ASSERT_TRUE(lock.acquire());
    lock.close(longEnough);
    EXPECT_FALSE(lock.acquire());
    lock.release();
    lock.endRequest();
}

TEST(LockClosingTest, AForkedChildDoesNotWait) {
    RequestLock lock;
    EventLog log;
    std::thread inside([&] {
        lock.beginRequest();
        EXPECT_TRUE(lock.acquire());
        log.note("inside");
        log.await("forked");
        lock.release();
        lock.endRequest();
    });
    log.await("inside");
    const pid_t child = fork();
    if (child == 0) {
        alarm(60);  // waiting for a request of the parent process would block the child forever
        lock.close(longEnough);
        _exit(7);
    }
    int status = 0;
    EXPECT_EQ(waitpid(child, &status, 0), child);
    EXPECT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 7);
    log.note("forked");
    inside.join();
}

TEST(LockClosingTest, ARequestWithoutItsManagerHasNoSessionAndReleasesTheLock) {
    const gate::ClientRequest late{nullptr, nullptr, nullptr, gate::theRequestLock.generation() + 1};
    EXPECT_THROW(gate::ProviderSession{late}, gate::ManagerGone);
    const gate::ClientRequest inTime{nullptr, nullptr, nullptr, gate::theRequestLock.generation()};
    EXPECT_THROW(gate::ProviderSession{inTime}, gate::ManagerGone) << "there is no manager";
    const gate::LockGuard next;
    EXPECT_EQ(gate::theRequestLock.waiting(), 0U) << "both sessions released the lock";
}

}  // namespace
}  // namespace gatetest
