#pragma once

#include <condition_variable>
#include <cstddef>
#include <mutex>

namespace gate {

/**
 * Lets one thread at a time to the provider, in order of arrival.
 *
 * A request arrives, takes turns, and departs. In between it may take several turns, and lets others in while it waits
 * for the object manager (Pause). The lock is no thread's own: during a pause the same thread may come again with
 * another request. Once the gate closes no request arrives any more, those that have arrived are served to their end.
 *
 * It needs no destruction: a late request finds it as it was left.
 */
class Gate {
public:
    constexpr Gate() = default;
    Gate(const Gate&) = delete;
    Gate& operator=(const Gate&) = delete;

    /** Whether the request is let in; if so, depart() has to follow. */
    bool arrive() noexcept;
    void depart() noexcept;

    /** Waits for the turn, behind all who came before. */
    void enter() noexcept;
    /** Gives the turn to who has waited longest. */
    void leave() noexcept;

    /** Lets no further request arrive and waits until all have departed but the calling thread's own. */
    void close() noexcept;

    /** How many wait for their turn. */
    std::size_t waiting() const noexcept;

private:
    struct Waiter;

    mutable std::mutex mutex{};
    bool isTaken = false;
    bool isClosed = false;
    std::size_t arrived = 0;
    std::size_t queued = 0;
    Waiter* first = nullptr;  ///< the queue; each waiter stands on the stack of its thread
    Waiter* last = nullptr;
    std::condition_variable* closing = nullptr;  ///< who waits in close()
};

/** The gate of this library: there is one provider behind it. */
extern Gate theGate;

/** A turn at the gate while it lives. */
class Turn {
public:
    Turn() noexcept { theGate.enter(); }
    ~Turn() { theGate.leave(); }
    Turn(const Turn&) = delete;
    Turn& operator=(const Turn&) = delete;
};

/** Interrupts the turn that the caller has, while it lives. */
class Pause {
public:
    Pause() noexcept { theGate.leave(); }
    ~Pause() { theGate.enter(); }
    Pause(const Pause&) = delete;
    Pause& operator=(const Pause&) = delete;
};

}  // namespace gate
