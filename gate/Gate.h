#pragma once

#include "Failure.h"

#include <sys/types.h>

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <functional>
#include <mutex>

namespace gate {

/**
 * Lets one thread at a time to the provider, in order of arrival.
 *
 * A request arrives, takes turns, and departs. In between it may take several turns, and lets others in while it waits
 * for the object manager. The lock is no thread's own: during such an interruption the same thread may come again with
 * another request.
 *
 * A gate that closes lets nobody in any more; who has a turn, waits for one or comes back from an interruption is
 * served. Once it is shut, nobody is inside, and who comes back is sent away, or waits for it to be opened again
 * (Pause).
 *
 * It needs no destruction: a late request finds it as it was left.
 */
class Gate {
public:
    enum class Closing { untilOpened, forGood };

    constexpr Gate() = default;
    Gate(const Gate&) = delete;
    Gate& operator=(const Gate&) = delete;

    /** Whether the request is let in. Then depart() has to follow. */
    bool arrive() noexcept;
    void depart() noexcept;

    /** Waits for the turn, behind all who came before; false, and no turn, when the gate closes. */
    bool enter() noexcept;
    /** Gives the turn to who has waited longest. */
    void leave() noexcept;
    /** Waits for the turn after a leave() that only interrupted it; also while the gate is shut. */
    void comeBack() noexcept;
    /** The same, but false, and no turn, once the gate has been shut since that round. */
    bool resume(std::size_t round) noexcept;

    /** How often the gate has been shut. Who goes on in another round than it came has lost its object manager. */
    std::size_t round() const noexcept { return timesShut; }

    /**
     * Shuts the gate when nobody is inside or waits to be, but for the calling thread. Before that it gives the
     * requests that have arrived some time to depart, no more: they may wait for who never answers.
     * Does nothing in a process that was forked off from the one in which the requests are.
     * @param atEnd called just before the gate is shut, with nobody else inside; must not throw
     * @return whether it was this call that shut the gate
     */
    bool close(std::chrono::milliseconds patience, Closing closing = Closing::untilOpened,
               const std::function<void()>& atEnd = nullptr) noexcept;

    /** Opens a gate that is shut. @return whether it is open now: it is not while it closes, or when shut for good */
    bool open() noexcept;

    /** Whether requests that were let in on other threads have not departed. */
    bool hasOthers() const noexcept;

    /** How many wait for their turn. */
    std::size_t waiting() const noexcept;
    /** How many wait to shut the gate. */
    std::size_t closing() const noexcept;

private:
    enum class State { open, closing, shut };
    enum class WhenShut { goAway, wait };
    struct Waiter;

    /** Who waits, in order; each waiter stands on the stack of its thread. */
    struct Queue {
        Waiter* first = nullptr;
        Waiter* last = nullptr;
        std::size_t length = 0;
    };

    bool waitForTurn(std::unique_lock<std::mutex>& lock, WhenShut whenShut);
    void join(Waiter& waiter);
    void sendAway();
    void admitNext();
    bool isEmptyButForCaller() const;
    void shut(std::unique_lock<std::mutex>& lock, const std::function<void()>& atEnd);
    void tellClosers();

    mutable std::mutex mutex{};
    std::atomic<State> state{State::open};  ///< changed by who has the lock
    std::atomic<std::size_t> timesShut{0};
    bool isForGood = false;
    bool isTaken = false;
    std::size_t arrived = 0;
    std::atomic<pid_t> process{0};  ///< in which the latest request arrived
    Queue queue{};
    Waiter* closers = nullptr;  ///< who waits in close()
};

/** The gate of this library: there is one provider behind it. */
extern Gate theGate;

/** Keeps the thread from being cancelled while it lives: that would end the process, or cut a file in two. */
class Uncancelled {
public:
    Uncancelled() noexcept;
    ~Uncancelled();
    Uncancelled(const Uncancelled&) = delete;
    Uncancelled& operator=(const Uncancelled&) = delete;

private:
    int before = 0;
};

/** What a client is told that comes to a gate that closes. */
constexpr const char* closedText = "The provider is shutting down. Ask again when the object manager has restarted.";

/** A turn at the gate while it lives; CMPI_RC_ERR_FAILED when the gate closes. */
class Turn {
public:
    Turn() : isHeld(theGate.enter()) {
        if (!isHeld) {
            fail(CMPI_RC_ERR_FAILED, closedText);
        }
    }
    ~Turn() {
        if (isHeld) {
            theGate.leave();
        }
    }
    Turn(const Turn&) = delete;
    Turn& operator=(const Turn&) = delete;

    /** Does some work while others may have the turn. Ended when the gate was shut meanwhile; the turn is lost then. */
    template <class Work>
    void interruptFor(Work work) {
        theGate.leave();
        isHeld = false;
        try {
            work();
        } catch (...) {
            resume();
            throw;
        }
        resume();
    }

private:
    void resume() {
        isHeld = theGate.resume(round);
        if (!isHeld) {
            throw Ended{};
        }
    }

    Uncancelled uncancelled;
    bool isHeld;
    const std::size_t round = theGate.round();  ///< with the turn, it is still that of the request
};

/** Interrupts the turn that the caller has, while it lives: for what cannot end there, in the middle of a provider. */
class Pause {
public:
    Pause() noexcept { theGate.leave(); }
    ~Pause() { theGate.comeBack(); }
    Pause(const Pause&) = delete;
    Pause& operator=(const Pause&) = delete;
};

}  // namespace gate
