#include <gtest/gtest.h>

#include <mutex>
#include <stdexcept>
#include <thread>
#include <vector>

#include "operations/RequestThread.h"

namespace {

TEST(RequestThread, AThreadBelongsToTheChainOfItsStarter) {
    const cimhost::RequestChain mine = cimhost::requestChain();
    cimhost::RequestChain other = nullptr;
    cimhost::onNewThread([&] { other = cimhost::requestChain(); });
    EXPECT_EQ(other, mine);
    std::thread([&] { other = cimhost::requestChain(); }).join();
    EXPECT_NE(other, mine);
}

TEST(RequestThread, AnExceptionIsRethrownByTheCaller) {
    EXPECT_THROW(cimhost::onNewThread([] { throw std::runtime_error("x"); }), std::runtime_error);
}

TEST(ChainMutex, AChainLocksItAgainOnAnotherThread) {
    cimhost::ChainMutex mutex;
    const std::lock_guard<cimhost::ChainMutex> lock(mutex);
    bool isLocked = false;
    cimhost::onNewThread([&] {
        const std::lock_guard<cimhost::ChainMutex> again(mutex);
        isLocked = true;
    });
    EXPECT_TRUE(isLocked);
}

TEST(ChainMutex, ExcludesOtherChains) {
    cimhost::ChainMutex mutex;
    int counter = 0;
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back([&] {
            for (int j = 0; j < 500; ++j) {
                const std::lock_guard<cimhost::ChainMutex> lock(mutex);
                ++counter;
            }
        });
    }
    for (std::thread& each : threads) {
        each.join();
    }
    EXPECT_EQ(counter, 2000);
}

}  // namespace
