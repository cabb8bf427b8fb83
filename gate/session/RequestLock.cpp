#include "RequestLock.h"

#include <utility>

#include "durable/CurrentProcess.h"

namespace gate {

namespace {

/** The requests of this thread, for which close() must not wait. */
thread_local std::size_t requestsHere = 0;

/** Whether this thread holds the lock, which close() then has to leave to it. */
thread_local bool isHeldHere = false;

}  // namespace

RequestLock theRequestLock;

/** A waiting thread, as an element of a list. */
struct RequestLock::Waiter {
    enum class Result { none, admitted, refused };

    /** Wakes the thread. Called with the mutex locked, so that the waiter still exists. */
    void end(Result itsResult) {
        result = itsResult;
        wakeUp.notify_one();
    }

    IfClosed ifClosed = IfClosed::fail;
    Result result = Result::none;
    std::condition_variable wakeUp{};
    Waiter* next = nullptr;
};

/** The link of a list that points to a waiter, or the null link at its end. */
RequestLock::Waiter*& RequestLock::linkTo(const Waiter* waiter, Waiter*& list) {
    Waiter** link = &list;
    while (*link != waiter) {
        link = &(*link)->next;
    }
    return *link;
}

bool RequestLock::beginRequest() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    if (state != State::open) {
        return false;
    }
    process = durable::currentProcess();
    ++requests;
    ++requestsHere;
    return true;
}

void RequestLock::endRequest() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    --requests;
    --requestsHere;
    notifyClosers();
}

bool RequestLock::acquire() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    return state == State::open && waitForLock(lock, IfClosed::fail);
}

void RequestLock::reacquire() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    waitForLock(lock, IfClosed::wait);
}

bool RequestLock::reacquire(std::size_t itsGeneration) noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    return timesClosed == itsGeneration && waitForLock(lock, IfClosed::fail);
}

bool RequestLock::waitForLock(std::unique_lock<std::mutex>& lock, IfClosed ifClosed) {
    if (isHeld || state == State::closed) {
        Waiter self{ifClosed};
        linkTo(nullptr, waiters) = &self;
        self.wakeUp.wait(lock, [&] { return self.result != Waiter::Result::none; });
        isHeldHere = self.result == Waiter::Result::admitted;
    } else {
        isHeld = isHeldHere = true;
    }
    return isHeldHere;
}

/** Empties the queue, except for the threads that wait for a closed lock. */
void RequestLock::refuseWaiters() {
    for (Waiter** link = &waiters; *link != nullptr;) {
        Waiter& waiter = **link;
        if (waiter.ifClosed == IfClosed::wait) {
            link = &waiter.next;
        } else {
            *link = waiter.next;
            waiter.end(Waiter::Result::refused);
        }
    }
}

void RequestLock::release() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    isHeldHere = false;
    isHeld = false;
    admitNext();
    notifyClosers();
}

/** Passes the lock, if it is free and open, directly to the longest waiter, so that a newcomer cannot overtake it. */
void RequestLock::admitNext() {
    if (waiters != nullptr && !isHeld && state != State::closed) {
        isHeld = true;
        std::exchange(waiters, waiters->next)->end(Waiter::Result::admitted);
    }
}

void RequestLock::notifyClosers() {
    for (Waiter* closer = closers; closer != nullptr; closer = closer->next) {
        closer->wakeUp.notify_one();
    }
}

bool RequestLock::close(std::chrono::milliseconds drainTimeout, Closing closing,
                        const std::function<void()>& atEnd) noexcept {
    if (process != 0 && process != durable::currentProcess()) {
        return false;  // the threads that hold the lock and the mutex are not in this process
    }
    const CancellationDisabled cancellationDisabled;
    std::unique_lock<std::mutex> lock(mutex);
    isPermanent = isPermanent || closing == Closing::permanent;
    if (state == State::closed) {
        return false;
    }
    state = State::closing;
    Waiter self;
    linkTo(nullptr, closers) = &self;
    const auto isClosedByOther = [&, before = generation()] { return timesClosed != before; };
    self.wakeUp.wait_for(lock, drainTimeout, [&] { return requests <= requestsHere || isClosedByOther(); });
    self.wakeUp.wait(lock, [&] { return !isHeld || isHeldHere || isClosedByOther(); });
    linkTo(&self, closers) = self.next;
    if (isClosedByOther()) {
        return false;
    }
    const bool wasHeld = std::exchange(isHeld, true);  // no other closer and no returning request acquires it
    lock.unlock();
    atEnd();
    lock.lock();
    isHeld = wasHeld;
    state = State::closed;
    ++timesClosed;
    refuseWaiters();
    notifyClosers();
    return true;
}

bool RequestLock::open() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    if (state == State::closed && !isPermanent) {
        state = State::open;
        admitNext();
    }
    return state == State::open;
}

bool RequestLock::hasOtherRequests() const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    return requests > requestsHere;
}

std::size_t RequestLock::count(Waiter* const& first) const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    std::size_t length = 0;
    for (const Waiter* waiter = first; waiter != nullptr; waiter = waiter->next) {
        ++length;
    }
    return length;
}

}  // namespace gate
