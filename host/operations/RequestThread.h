#pragma once

#include <condition_variable>
#include <functional>
#include <mutex>

// A request chain is a request and the requests that providers send while they perform it, possibly on other threads.

namespace cimhost {

/** Identifies a request chain. */
using RequestChain = const void*;

/** The chain of the calling thread. A thread that is not a ChainMember has a separate chain. */
RequestChain requestChain();

/** Makes the calling thread a member of a chain while this object exists. */
class ChainMember {
public:
    explicit ChainMember(RequestChain chain);
    ~ChainMember();
    ChainMember(const ChainMember&) = delete;
    ChainMember& operator=(const ChainMember&) = delete;
};

/** Runs the body on a new thread of the caller's chain, and waits until it returns. Rethrows its exceptions. */
void onNewThread(const std::function<void()>& body);

/** A recursive mutex whose owner is a chain, not a thread. */
class ChainMutex {
public:
    void lock();
    void unlock();

private:
    std::mutex mutex;
    std::condition_variable freed;
    RequestChain owner = nullptr;
    int depth = 0;  ///< number of lock() calls of the owner without their unlock()
};

}  // namespace cimhost
