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
    WhenShut whenShut = WhenShut::goAway;
    bool isAdmitted = false;
    bool isSentAway = false;
    Waiter* next = nullptr;
};

bool Gate::arrive() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    if (state != State::open) {
        return false;
    }
    process = getpid();
    ++arrived;
    ++arrivedHere;
    return true;
}

void Gate::depart() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    --arrived;
    --arrivedHere;
    tellClosers();
}

bool Gate::enter() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    return state == State::open && waitForTurn(lock, WhenShut::goAway);
}

void Gate::comeBack() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    waitForTurn(lock, WhenShut::wait);
}

bool Gate::resume(std::size_t round) noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    return timesShut == round && waitForTurn(lock, WhenShut::goAway);
}

bool Gate::waitForTurn(std::unique_lock<std::mutex>& lock, WhenShut whenShut) {
    const bool canWait = state != State::shut || whenShut == WhenShut::wait;
    if (canWait && (isTaken || state == State::shut)) {
        Waiter self;
        self.whenShut = whenShut;
        join(self);
        self.call.wait(lock, [&] { return self.isAdmitted || self.isSentAway; });
        isInsideHere = self.isAdmitted;
    } else {
        isInsideHere = canWait;
        isTaken = isTaken || canWait;
    }
    return isInsideHere;
}

void Gate::join(Waiter& waiter) {
    (queue.first == nullptr ? queue.first : queue.last->next) = &waiter;
    queue.last = &waiter;
    ++queue.length;
}

/** Those in the queue who do not wait for a gate that is shut. */
void Gate::sendAway() {
    Waiter* next = queue.first;
    queue = {};
    while (next != nullptr) {
        Waiter& waiter = *next;
        next = waiter.next;
        waiter.next = nullptr;
        if (waiter.whenShut == WhenShut::wait) {
            join(waiter);
        } else {
            waiter.isSentAway = true;
            waiter.call.notify_one();  // under the lock: the waiter lives until it has it
        }
    }
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
    sendAway();
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

std::size_t Gate::closing() const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    std::size_t count = 0;
    for (const Waiter* closer = closers; closer != nullptr; closer = closer->next) {
        ++count;
    }
    return count;
}

Uncancelled::Uncancelled() noexcept {
    pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &before);
}

Uncancelled::~Uncancelled() {
    pthread_setcancelstate(before, &before);
}

}  // namespace gate
