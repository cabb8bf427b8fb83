#pragma once

#include <condition_variable>
#include <functional>
#include <mutex>

// Which requests belong together, on whatever threads they run.

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

/** Runs the body on a new thread, which works for the caller's chain; rethrows what it throws. */
void onNewThread(const std::function<void()>& body);

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
