#include "operations/RequestThread.h"

#include <future>
#include <thread>
#include <utility>

namespace cimhost {
namespace {

/** The chain that this thread is a member of; null if it has a separate one. */
RequestChain& joinedChain() {
    thread_local RequestChain chain = nullptr;
    return chain;
}

}  // namespace

RequestChain requestChain() {
    return joinedChain() == nullptr ? &joinedChain() : joinedChain();
}

ChainMember::ChainMember(RequestChain chain) {
    joinedChain() = chain;
}

ChainMember::~ChainMember() {
    joinedChain() = nullptr;
}

void onNewThread(const std::function<void()>& body) {
    const RequestChain chain = requestChain();
    std::packaged_task<void()> task([&] {
        const ChainMember member(chain);
        body();
    });
    std::future<void> done = task.get_future();
    std::thread thread(std::move(task));
    thread.join();
    done.get();
}

void ChainMutex::lock() {
    const RequestChain chain = requestChain();
    std::unique_lock<std::mutex> lock(mutex);
    freed.wait(lock, [&] { return depth == 0 || owner == chain; });
    owner = chain;
    ++depth;
}

void ChainMutex::unlock() {
    const std::lock_guard<std::mutex> lock(mutex);
    --depth;
    freed.notify_one();
}

}  // namespace cimhost
