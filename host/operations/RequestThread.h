#pragma once

#include <condition_variable>
#include <future>
#include <mutex>
#include <thread>
#include <utility>

#include "broker/Broker.h"

// On which thread a request runs, and which requests belong together.

namespace cimhost {

/** Identifies a request together with the up-calls that come out of it, on whatever threads these run. */
using RequestChain = const void*;

/** The chain that the calling thread works for. A thread that works for no other one's chain is one of its own. */
RequestChain requestChain();

/** Lets the calling thread work for a chain, for as long as it lives. */
class ChainMember {
public:
    explicit ChainMember(RequestChain chain);
    ~ChainMember();
    ChainMember(const ChainMember&) = delete;
    ChainMember& operator=(const ChainMember&) = delete;
};

/** Runs the body on a thread of its own, which works for the caller's chain; what it throws is thrown here. */
template <class Body>
auto onOwnThread(Body&& body) {
    const RequestChain chain = requestChain();
    std::packaged_task task([&body, chain] {
        const ChainMember member(chain);
        return body();
    });
    auto outcome = task.get_future();
    std::thread thread(std::move(task));
    thread.join();
    return outcome.get();
}

/** Runs the body of a request on the thread on which the broker's object manager would. */
template <class Body>
auto onRequestThread(const Broker& broker, Body&& body) {
    const bool isNested = Broker::arenaOfThread() != nullptr;
    switch (broker.profile().thread) {
        case RequestThread::own:
            return onOwnThread(body);
        case RequestThread::ownUnlessNested:
            return isNested ? body() : onOwnThread(body);
        default:
            return body();
    }
}

/** A mutex that a chain of requests may lock again while it holds it, on another thread too. */
class ChainMutex {
public:
    void lock();
    void unlock();

private:
    std::mutex mutex;
    std::condition_variable freed;
    RequestChain owner = nullptr;
    int depth = 0;  ///< how often the owner holds it
};

}  // namespace cimhost
