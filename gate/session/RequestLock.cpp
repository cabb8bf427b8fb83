#include "RequestLock.h"

#include <utility>

#include "durable/CurrentProcess.h"

namespace gate {

namespace {

/** The number of requests of this thread. A close() on this thread must not wait for them. */
thread_local std::size_t requestsHere = 0;

/** Whether this thread holds the lock. If so, a close() on this thread does not wait for it or release it. */
thread_local bool isHeldHere = false;

}  // namespace

RequestLock theRequestLock;

/** A waiting thread, as an element of a list. */
struct RequestLock::Waiter {
    std::condition_variable wakeUp{};
    Waiter* next = nullptr;
};

/** The link that points to a waiter in a list; for null, the null link at the end of the list. */
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
    notifyAll(closers);
}

bool RequestLock::acquire() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    return state == State::open && waitForLock(lock, generation());
}

bool RequestLock::reacquire(std::optional<std::size_t> itsGeneration) noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    return waitForLock(lock, itsGeneration);
}

/** Waits for the lock; with a generation, at most until it ends. Returns whether this thread holds the lock. */
bool RequestLock::waitForLock(std::unique_lock<std::mutex>& lock, std::optional<std::size_t> itsGeneration) {
    Waiter self;
    linkTo(nullptr, waiters) = &self;
    const auto isRefused = [&] { return itsGeneration && timesClosed != *itsGeneration; };
    const auto isAdmitted = [&] { return waiters == &self && !isHeld && state != State::closed; };
    self.wakeUp.wait(lock, [&] { return isRefused() || isAdmitted(); });
    linkTo(&self, waiters) = self.next;
    isHeldHere = !isRefused();
    if (isHeldHere) {
        isHeld = true;
    } else {
        notify();
    }
    return isHeldHere;
}

void RequestLock::release() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    isHeldHere = false;
    isHeld = false;
    notify();
}

/** Wakes the threads in close() and the longest waiter. Newcomers cannot overtake that waiter. */
void RequestLock::notify() {
    if (waiters != nullptr) {
        waiters->wakeUp.notify_one();
    }
    notifyAll(closers);
}

/** Wakes all threads of a list. Call it with the mutex locked, so that the waiters still exist. */
void RequestLock::notifyAll(Waiter* list) {
    for (Waiter* waiter = list; waiter != nullptr; waiter = waiter->next) {
        waiter->wakeUp.notify_one();
    }
}

bool RequestLock::close(std::chrono::milliseconds timeout, Closing closing,
                        const std::function<void()>& atEnd) noexcept {
    if (process != 0 && process != durable::currentProcess()) {
        return false;  // threads that hold the lock or the mutex exist only in the parent process
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
    const auto isFree = [&] { return !isHeld && waiters == nullptr; };
    self.wakeUp.wait_for(lock, timeout, [&] { return requests <= requestsHere || isClosedByOther(); });
    self.wakeUp.wait(lock, [&] { return isFree() || isHeldHere || isClosedByOther(); });
    linkTo(&self, closers) = self.next;
    if (isClosedByOther()) {
        return false;
    }
    const bool wasHeld = std::exchange(isHeld, true);  // so that no other close() and no reacquire() continues
    lock.unlock();
    atEnd();
    lock.lock();
    isHeld = wasHeld;
    state = State::closed;
    ++timesClosed;
    notifyAll(waiters);
    notifyAll(closers);
    return true;
}

bool RequestLock::open() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    if (state == State::closed && !isPermanent) {
        state = State::open;
        notify();
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
