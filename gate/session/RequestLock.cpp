#include "RequestLock.h"

#include <pthread.h>
#include <unistd.h>

#include <utility>

namespace gate {

namespace {

/** The requests of this thread, for which close() must not wait. */
thread_local std::size_t requestsHere = 0;

/** Whether this thread holds the lock, which close() then has to leave to it. */
thread_local bool isHeldHere = false;

}  // namespace

RequestLock theRequestLock;

struct RequestLock::Waiter {
    std::condition_variable wakeUp{};
    IfClosed ifClosed = IfClosed::fail;
    bool isAdmitted = false;
    bool isRefused = false;
    Waiter* next = nullptr;
};

bool RequestLock::beginRequest() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    if (state != State::open) {
        return false;
    }
    process = getpid();
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
    const bool canWait = state != State::closed || ifClosed == IfClosed::wait;
    if (canWait && (isHeld || state == State::closed)) {
        Waiter self;
        self.ifClosed = ifClosed;
        enqueue(self);
        self.wakeUp.wait(lock, [&] { return self.isAdmitted || self.isRefused; });
        isHeldHere = self.isAdmitted;
    } else {
        isHeldHere = canWait;
        isHeld = isHeld || canWait;
    }
    return isHeldHere;
}

void RequestLock::enqueue(Waiter& waiter) {
    (queue.first == nullptr ? queue.first : queue.last->next) = &waiter;
    queue.last = &waiter;
    ++queue.length;
}

/** Empties the queue, except for the threads that wait for a closed lock. */
void RequestLock::refuseWaiters() {
    Waiter* next = queue.first;
    queue = {};
    while (next != nullptr) {
        Waiter& waiter = *next;
        next = waiter.next;
        waiter.next = nullptr;
        if (waiter.ifClosed == IfClosed::wait) {
            enqueue(waiter);
        } else {
            waiter.isRefused = true;
            waiter.wakeUp.notify_one();  // with the mutex locked, so that the waiter still exists
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

/** Passes the lock directly to the longest waiter, so that a newcomer cannot overtake it. */
void RequestLock::admitNext() {
    if (queue.first == nullptr || state == State::closed) {
        return;
    }
    Waiter& next = *queue.first;
    queue.first = next.next;
    --queue.length;
    isHeld = true;
    next.isAdmitted = true;
    next.wakeUp.notify_one();  // with the mutex locked, so that the waiter still exists
}

bool RequestLock::isFreeForCaller() const {
    return !isHeld || isHeldHere;
}

void RequestLock::notifyClosers() {
    for (Waiter* closer = closers; closer != nullptr; closer = closer->next) {
        closer->wakeUp.notify_one();
    }
}

bool RequestLock::close(std::chrono::milliseconds drainTimeout, Closing closing,
                        const std::function<void()>& atEnd) noexcept {
    const pid_t itsProcess = process;
    if (itsProcess != 0 && itsProcess != getpid()) {
        return false;  // the threads that hold the lock and the mutex are not in this process
    }
    const CancellationDisabled cancellationDisabled;
    std::unique_lock<std::mutex> lock(mutex);
    isPermanent = isPermanent || closing == Closing::permanent;
    if (state == State::closed) {
        return false;
    }
    state = State::closing;
    const std::size_t before = timesClosed;
    const auto isClosedByOther = [&] { return timesClosed != before; };
    Waiter self;
    self.next = closers;
    closers = &self;
    self.wakeUp.wait_for(lock, drainTimeout, [&] { return requests <= requestsHere || isClosedByOther(); });
    self.wakeUp.wait(lock, [&] { return isFreeForCaller() || isClosedByOther(); });
    const bool isMine = !isClosedByOther();
    if (isMine) {
        finishClosing(lock, atEnd);
    }
    Waiter** link = &closers;
    while (*link != &self) {
        link = &(*link)->next;
    }
    *link = self.next;
    return isMine;
}

/** Calls atEnd with the lock held, so that no other closer and no returning request acquires it meanwhile. */
void RequestLock::finishClosing(std::unique_lock<std::mutex>& lock, const std::function<void()>& atEnd) {
    const bool wasHeld = std::exchange(isHeld, true);
    if (atEnd) {
        lock.unlock();
        atEnd();
        lock.lock();
    }
    isHeld = wasHeld;
    state = State::closed;
    ++timesClosed;
    refuseWaiters();
    notifyClosers();
}

bool RequestLock::open() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    if (state == State::closed && !isPermanent) {
        state = State::open;
        if (!isHeld) {
            admitNext();
        }
    }
    return state == State::open;
}

bool RequestLock::hasOtherRequests() const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    return requests > requestsHere;
}

std::size_t RequestLock::waiting() const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    return queue.length;
}

std::size_t RequestLock::closing() const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    std::size_t count = 0;
    for (const Waiter* closer = closers; closer != nullptr; closer = closer->next) {
        ++count;
    }
    return count;
}

CancellationDisabled::CancellationDisabled() noexcept {
    pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &before);
}

CancellationDisabled::~CancellationDisabled() {
    pthread_setcancelstate(before, &before);
}

}  // namespace gate
