#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <deque>
#include <optional>
#include <thread>

#include "TcpPair.h"
#include "server/PasswordQueue.h"

using namespace cimhost::server;
using namespace std::chrono_literals;

namespace {

class PasswordQueueTest : public testing::Test {
protected:
    ~PasswordQueueTest() override { finish(); }

    Connection& connect(const std::string& network) {
        return *table.add(sockets.emplace_back().server.get(), false, {network + ":1", network});
    }

    static Connection::Clock::time_point later() { return Connection::Clock::now() + 1h; }

    /** Starts a connection that waits for its slot, and notes its name then. */
    void wait(const std::string& network, const std::string& name) {
        const std::size_t before = queue.waiting();
        threads.emplace_back([this, name, &connection = connect(network)] {
            const PasswordQueue::Slot slot(queue, connection, later());
            turns.push_back(slot ? name : "none");  // one thread at a time has the slot
        });
        while (queue.waiting() == before) {
            std::this_thread::yield();
        }
    }

    void finish() {
        for (std::thread& each : threads) {
            each.join();
        }
        threads.clear();
    }

    Limits limits;
    ConnectionTable table{limits};
    std::deque<test::TcpPair> sockets;
    PasswordQueue queue;
    std::vector<std::thread> threads;
    std::vector<std::string> turns;
};

TEST_F(PasswordQueueTest, NetworksTakeTurns) {
    std::optional<PasswordQueue::Slot> first(std::in_place, queue, connect("a"), later());
    for (const auto& [network, name] : {std::pair{"a", "a1"}, {"a", "a2"}, {"a", "a3"}, {"b", "b1"}, {"c", "c1"}}) {
        wait(network, name);
    }
    first.reset();
    finish();
    EXPECT_THAT(turns, testing::ElementsAre("a1", "b1", "c1", "a2", "a3"));
}

TEST_F(PasswordQueueTest, AConnectionThatWaitsTooLongLosesItsTurn) {
    std::optional<PasswordQueue::Slot> first(std::in_place, queue, connect("a"), later());
    EXPECT_FALSE(PasswordQueue::Slot(queue, connect("b"), Connection::Clock::now()));
    EXPECT_EQ(queue.waiting(), 0U);
    wait("c", "c1");
    first.reset();
    finish();
    EXPECT_THAT(turns, testing::ElementsAre("c1"));
    EXPECT_TRUE(PasswordQueue::Slot(queue, connect("b"), Connection::Clock::now()));
}

TEST_F(PasswordQueueTest, AConnectionThatIsEndedLeavesTheQueue) {
    const PasswordQueue::Slot first(queue, connect("a"), later());
    wait("b", "b1");
    table.endAll();
    finish();
    EXPECT_THAT(turns, testing::ElementsAre("none"));
    EXPECT_EQ(queue.waiting(), 0U);
}

}  // namespace
