#include "Gate.h"

#include <pthread.h>
#include <unistd.h>

#include <utility>

namespace gate {

namespace {

/** Requests that arrived on this thread and have not departed: those that closing must not wait for. */
thread_local std::size_t arrivedHere = 0;

/** Whether this thread has the turn, in which closing has to leave it. */
thread_local bool isInsideHere = false;

}  // namespace

Gate theGate;

struct Gate::Waiter {
    std::condition_variable call{};
    bool isAdmitted = false;
    Waiter* next = nullptr;
};

bool Gate::arrive() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    process = getpid();
    ++arrived;
    ++arrivedHere;
    return state == State::open;
}

void Gate::depart() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    --arrived;
    --arrivedHere;
    tellClosers();
}

bool Gate::enter() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    if (state != State::open) {
        return false;
    }
    waitForTurn(lock);
    return true;
}

void Gate::comeBack() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    waitForTurn(lock);
}

void Gate::waitForTurn(std::unique_lock<std::mutex>& lock) {
    if (!isTaken && state != State::shut) {
        isTaken = true;
    } else {
        Waiter self;
        (queue.first == nullptr ? queue.first : queue.last->next) = &self;
        queue.last = &self;
        ++queue.length;
        self.call.wait(lock, [&] { return self.isAdmitted; });
    }
    isInsideHere = true;
}

void Gate::leave() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    isInsideHere = false;
    isTaken = false;
    admitNext();
    tellClosers();
}

/** Hands the turn over at once: who comes by just now cannot be quicker than who has waited. */
void Gate::admitNext() {
    if (queue.first == nullptr || state == State::shut) {
        return;
    }
    Waiter& next = *queue.first;
    queue.first = next.next;
    --queue.length;
    isTaken = true;
    next.isAdmitted = true;
    next.call.notify_one();  // under the lock: the waiter lives until it has it
}

bool Gate::isEmptyButForCaller() const {
    return !isTaken || isInsideHere;
}

void Gate::tellClosers() {
    for (Waiter* closer = closers; closer != nullptr; closer = closer->next) {
        closer->call.notify_one();
    }
}

void Gate::pass() noexcept {
    if (state == State::shut && !isInsideHere) {
        comeBack();
        leave();
    }
}

bool Gate::close(std::chrono::milliseconds patience, Closing closing, const std::function<void()>& atEnd) noexcept {
    const pid_t its = process;
    if (its != 0 && its != getpid()) {
        return false;  // the threads that have the lock and the turn are not in this process
    }
    const Uncancelled uncancelled;
    std::unique_lock<std::mutex> lock(mutex);
    isForGood = isForGood || closing == Closing::forGood;
    if (state == State::shut) {
        return false;
    }
    state = State::closing;
    const std::size_t before = timesShut;
    const auto isShutByOther = [&] { return timesShut != before; };
    Waiter self;
    self.next = closers;
    closers = &self;
    self.call.wait_for(lock, patience, [&] { return arrived <= arrivedHere || isShutByOther(); });
    self.call.wait(lock, [&] { return isEmptyButForCaller() || isShutByOther(); });
    const bool isMine = !isShutByOther();
    if (isMine) {
        shut(lock, atEnd);
    }
    Waiter** link = &closers;
    while (*link != &self) {
        link = &(*link)->next;
    }
    *link = self.next;
    return isMine;
}

/** With the turn taken, so that neither another closer nor who comes back gets in while the end goes on. */
void Gate::shut(std::unique_lock<std::mutex>& lock, const std::function<void()>& atEnd) {
    const bool wasTaken = std::exchange(isTaken, true);
    if (atEnd) {
        lock.unlock();
        atEnd();
        lock.lock();
    }
    isTaken = wasTaken;
    state = State::shut;
    ++timesShut;
    tellClosers();
}

bool Gate::open() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    if (state == State::shut && !isForGood) {
        state = State::open;
        if (!isTaken) {
            admitNext();
        }
    }
    return state == State::open;
}

bool Gate::hasOthers() const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    return arrived > arrivedHere;
}

std::size_t Gate::waiting() const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    return queue.length;
}

Uncancelled::Uncancelled() noexcept {
    pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &before);
}

Uncancelled::~Uncancelled() {
    pthread_setcancelstate(before, &before);
}

}  // namespace gate
