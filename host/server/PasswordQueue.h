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
 * The connections whose passwords are to be checked, one after the other. Client networks take turns, so that one with
 * many connections does not delay the others.
 */
class PasswordQueue {
public:
    /** The right to check a password, held until it is destroyed. */
    class Slot {
    public:
        /** Waits for it, but not longer than until a time or until the connection is ended. */
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
    std::list<Network> networks;  ///< with waiting connections; the first has the next turn
};

}  // namespace cimhost::server
