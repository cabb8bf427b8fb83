#pragma once

#include <atomic>
#include <cstddef>
#include <deque>
#include <list>
#include <mutex>
#include <string>

#include "server/ConnectionTable.h"

namespace cimhost::server {

/**
 * A queue of connections whose passwords are checked one after the other. Client networks take turns, so that a network
 * with many connections does not delay the others.
 */
class PasswordQueue {
public:
    /** Holds the right to check a password until the slot is destroyed. */
    class Slot {
    public:
        /** Waits until the slot is available, a time is reached or the connection is ended. */
        Slot(PasswordQueue& itsQueue, Connection& connection, Connection::Clock::time_point latest)
            : queue(itsQueue), acquired(queue.acquire(connection, latest)) {}
        ~Slot() {
            if (acquired) {
                queue.release();
            }
        }
        Slot(const Slot&) = delete;
        Slot& operator=(const Slot&) = delete;

        explicit operator bool() const { return acquired; }

    private:
        PasswordQueue& queue;
        bool acquired;
    };

    /** Number of connections that wait for a slot. */
    std::size_t waiting() const;

private:
    struct Waiter {
        Connection& connection;
        std::atomic<bool> hasSlot{false};
    };
    struct Network {
        std::string name;
        std::deque<Waiter*> waiters;
    };

    bool acquire(Connection& connection, Connection::Clock::time_point latest);
    void release();
    void add(Waiter& waiter);
    void remove(const Waiter& waiter);
    void passOn();

    mutable std::mutex mutex;
    bool isTaken = false;
    std::list<Network> networks;  ///< networks with waiting connections; the first has the next turn
};

}  // namespace cimhost::server
