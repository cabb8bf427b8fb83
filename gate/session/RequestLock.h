#pragma once

#include <pthread.h>
#include <sys/types.h>

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <functional>
#include <mutex>
#include <optional>

#include "gate/cmpi/Failure.h"

namespace gate {

/**
 * Admits threads to the provider one by one, in order of arrival, and waits for running requests at shutdown.
 *
 * A request begins, may acquire and release the lock several times, and ends. The lock belongs to no thread: while a
 * request has released it to wait for the object manager, another request on the same thread may acquire it.
 *
 * While the lock is closing, it refuses new requests and serves those that hold it, wait for it or reacquire it. Once
 * closed, only the closing thread can still hold it; reacquire() fails, or waits until the lock is opened again.
 *
 * The lock is never destroyed, so that a late request can use it. Therefore each waiting thread has its own condition
 * variable on its stack.
 */
class RequestLock {
public:
    enum class Closing { temporary, permanent };

    constexpr RequestLock() = default;

    /** Returns whether the request is admitted. If so, the caller has to call endRequest(). */
    bool beginRequest() noexcept;
    void endRequest() noexcept;

    /** Waits for the lock, behind all earlier callers. Returns false without the lock if it is closing or closed. */
    bool acquire() noexcept;
    /** Passes the lock to the longest waiter. */
    void release() noexcept;
    /**
     * Acquires the lock after an intermediate release(). If the lock is closed, waits until it is opened; with a
     * generation, returns false without the lock if that generation has ended.
     */
    bool reacquire(std::optional<std::size_t> itsGeneration = std::nullopt) noexcept;

    /** Number of shutdowns. A request of an earlier generation has lost its object manager. */
    std::size_t generation() const noexcept { return timesClosed; }

    /**
     * Waits for the requests of other threads to end, but no longer than the timeout, since a request may never end.
     * Then waits until no other thread holds the lock or waits for it, and closes it. Does nothing in a forked child,
     * since the requests are in its parent.
     * @param atEnd called just before the lock is closed, while no other thread holds it; must not throw
     * @return whether this call has closed the lock
     */
    bool close(
        std::chrono::milliseconds timeout, Closing closing = Closing::temporary,
        const std::function<void()>& atEnd = [] {}) noexcept;

    /** Opens a closed lock. @return whether it is open: false while it is closing, or if it is closed permanently */
    bool open() noexcept;

    /** Whether requests of other threads are running. */
    bool hasOtherRequests() const noexcept;

    /** The number of threads that wait for the lock. */
    std::size_t waiting() const noexcept { return count(waiters); }
    /** The number of threads that wait in close(). */
    std::size_t closing() const noexcept { return count(closers); }

private:
    enum class State { open, closing, closed };
    struct Waiter;

    bool waitForLock(std::unique_lock<std::mutex>& lock, std::optional<std::size_t> itsGeneration);
    void notify();
    static void notifyAll(Waiter* list);
    static Waiter*& linkTo(const Waiter* waiter, Waiter*& list);
    std::size_t count(Waiter* const& first) const noexcept;

    mutable std::mutex mutex{};
    State state = State::open;
    std::atomic<std::size_t> timesClosed{0};
    bool isPermanent = false;
    bool isHeld = false;
    std::size_t requests = 0;
    std::atomic<pid_t> process{0};  ///< the process of the latest request
    Waiter* waiters = nullptr;      ///< the threads that wait for the lock, in order of arrival
    Waiter* closers = nullptr;      ///< the threads that wait in close()
};

/** The only request lock of the process, since a process has one provider. */
extern RequestLock theRequestLock;

/** Counts a request as active, from before its first call to the broker until after its last one. */
class ActiveRequest {
public:
    ActiveRequest() noexcept : isAdmitted(theRequestLock.beginRequest()) {}
    ~ActiveRequest() {
        if (isAdmitted) {
            theRequestLock.endRequest();
        }
    }
    ActiveRequest(const ActiveRequest&) = delete;
    ActiveRequest& operator=(const ActiveRequest&) = delete;

    const bool isAdmitted;
};

/** Disables cancellation of the calling thread: cancelling it would end the process or leave a file incomplete. */
class CancellationDisabled {
public:
    CancellationDisabled() noexcept { pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &before); }
    ~CancellationDisabled() { pthread_setcancelstate(before, &before); }
    CancellationDisabled(const CancellationDisabled&) = delete;
    CancellationDisabled& operator=(const CancellationDisabled&) = delete;

private:
    int before = 0;
};

/** Holds the request lock. The constructor throws ManagerGone if the lock is closing or closed. */
class LockGuard {
public:
    LockGuard() : isHeld(theRequestLock.acquire()) { ManagerGone::throwUnless(isHeld); }
    ~LockGuard() {
        if (isHeld) {
            theRequestLock.release();
        }
    }

    /**
     * Releases the lock during a call to `work()`. Throws ManagerGone if the lock was closed meanwhile. After this and
     * other exceptions, the lock stays released.
     */
    template <class Work>
    void releaseFor(Work work) {
        const std::size_t generation = theRequestLock.generation();  // cannot change while the lock is held
        theRequestLock.release();
        isHeld = false;
        work();
        isHeld = theRequestLock.reacquire(generation);
        ManagerGone::throwUnless(isHeld);
    }

private:
    CancellationDisabled cancellationDisabled;
    bool isHeld;
};

}  // namespace gate
