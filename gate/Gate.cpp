#include "Gate.h"

namespace gate {

namespace {

/** Requests that arrived on this thread and have not departed: those that closing must not wait for. */
thread_local std::size_t arrivedHere = 0;

}  // namespace

Gate theGate;

struct Gate::Waiter {
    std::condition_variable admission;
    bool isAdmitted = false;
    Waiter* next = nullptr;
};

bool Gate::arrive() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    if (isClosed) {
        return false;
    }
    ++arrived;
    ++arrivedHere;
    return true;
}

void Gate::depart() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    --arrived;
    --arrivedHere;
    if (closing != nullptr) {
        closing->notify_one();
    }
}

void Gate::enter() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    if (!isTaken) {
        isTaken = true;
        return;
    }
    Waiter self;
    (first == nullptr ? first : last->next) = &self;
    last = &self;
    ++queued;
    self.admission.wait(lock, [&] { return self.isAdmitted; });
}

void Gate::leave() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    if (first == nullptr) {
        isTaken = false;
        return;
    }
    // Handed over, not given up: who comes by just now cannot be quicker than who has waited.
    Waiter& next = *first;
    first = next.next;
    --queued;
    next.isAdmitted = true;
    next.admission.notify_one();  // under the lock: the waiter lives until it has it
}

void Gate::close() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    isClosed = true;
    std::condition_variable departure;
    closing = &departure;
    departure.wait(lock, [&] { return arrived <= arrivedHere; });
    closing = nullptr;
}

std::size_t Gate::waiting() const noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    return queued;
}

}  // namespace gate
