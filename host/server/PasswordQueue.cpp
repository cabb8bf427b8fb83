#include "server/PasswordQueue.h"

#include <algorithm>
#include <numeric>

namespace cimhost::server {

bool PasswordQueue::acquire(Connection& connection, Connection::Clock::time_point latest) {
    Waiter waiter{connection};
    {
        const std::lock_guard<std::mutex> lock(mutex);
        if (!isTaken) {
            isTaken = true;
            return true;
        }
        add(waiter);
    }
    connection.waitUntil(latest, [&] { return waiter.hasSlot.load(); });
    const std::lock_guard<std::mutex> lock(mutex);
    if (!waiter.hasSlot) {
        remove(waiter);
    }
    return waiter.hasSlot;
}

std::size_t PasswordQueue::waiting() const {
    const std::lock_guard<std::mutex> lock(mutex);
    return std::accumulate(networks.begin(), networks.end(), std::size_t{0},
                           [](std::size_t sum, const Network& each) { return sum + each.waiters.size(); });
}

void PasswordQueue::release() {
    const std::lock_guard<std::mutex> lock(mutex);
    passOn();
}

/** Adds a waiting connection. The caller holds the mutex, as for the functions below. */
void PasswordQueue::add(Waiter& waiter) {
    const std::string& name = waiter.connection.client().network;
    auto network =
        std::find_if(networks.begin(), networks.end(), [&](const Network& each) { return each.name == name; });
    if (network == networks.end()) {
        network = networks.insert(networks.end(), {name, {}});
    }
    network->waiters.push_back(&waiter);
}

void PasswordQueue::remove(const Waiter& waiter) {
    for (auto network = networks.begin(); network != networks.end(); ++network) {
        auto& waiters = network->waiters;
        const auto found = std::find(waiters.begin(), waiters.end(), &waiter);
        if (found != waiters.end()) {
            waiters.erase(found);
            if (waiters.empty()) {
                networks.erase(network);
            }
            return;
        }
    }
}

/** Gives the slot to the longest waiting connection of the first network. Moves that network to the end. */
void PasswordQueue::passOn() {
    isTaken = !networks.empty();
    if (!isTaken) {
        return;
    }
    auto& waiters = networks.front().waiters;
    Waiter& next = *waiters.front();
    waiters.pop_front();
    if (waiters.empty()) {
        networks.pop_front();
    } else {
        networks.splice(networks.end(), networks, networks.begin());
    }
    next.hasSlot = true;
    next.connection.wake();
}

}  // namespace cimhost::server
