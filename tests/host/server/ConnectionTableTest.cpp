#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <deque>
#include <thread>

#include "TcpPair.h"
#include "server/ConnectionTable.h"

using namespace cimhost::server;
using namespace std::chrono_literals;

namespace {

using Phase = Connection::Phase;

/** Connections whose clients send only what a test sends. */
class ConnectionTableTest : public testing::Test {
protected:
    ConnectionTableTest() {
        limits.connections = 3;
        limits.connectionsPerAddress = 3;
        limits.headTime = 10s;
        limits.bodyTime = 30s;
        limits.responseTime = 300s;
        limits.idleTime = 600s;
    }

    struct Added {
        test::TcpPair sockets{};
        Connection* connection = nullptr;

        bool isOpen() const { return sockets.client.isSilent(); }
    };

    Added& add(const std::string& network = "a", bool isTls = false) {
        Added& added = all.emplace_back();
        added.connection = table.add(added.sockets.server.get(), isTls, {network + ":1", network});
        return added;
    }

    Added& addIn(Phase phase, bool isTrusted = false) {
        Added& added = add();
        added.connection->enter(phase);
        if (isTrusted) {
            added.connection->trust();
        }
        return added;
    }

    /** Checks the connections as if this time had passed. */
    void endOverdueAfter(std::chrono::milliseconds time) { table.endOverdue(Connection::Clock::now() + time); }

    Limits limits;
    ConnectionTable table{limits};
    std::deque<Added> all;
};

TEST_F(ConnectionTableTest, ANewConnectionEndsTheOldestWithoutACompleteRequest) {
    const Added& trusted = addIn(Phase::idle, true);
    const Added& oldest = addIn(Phase::body);
    const Added& younger = addIn(Phase::idle);
    const Added& added = add();
    EXPECT_FALSE(oldest.isOpen());
    EXPECT_TRUE(trusted.isOpen() && younger.isOpen() && added.isOpen());
    add();
    EXPECT_FALSE(younger.isOpen());
    EXPECT_TRUE(trusted.isOpen());
}

TEST_F(ConnectionTableTest, AClientThatMakesRoomBeforeItsFirstRequestReceives503) {
    const Added& silent = addIn(Phase::idle);
    const Added& sending = addIn(Phase::body);
    const Added& served = addIn(Phase::idle, true);
    for (int i = 0; i < 3; ++i) {
        add().connection->enter(Phase::work);
    }
    EXPECT_THAT(silent.sockets.client.receive(), testing::StartsWith("HTTP/1.1 503 "));
    EXPECT_THAT(sending.sockets.client.receive(), testing::StartsWith("HTTP/1.1 503 "));
    EXPECT_EQ(served.sockets.client.receive(), "");
}

TEST_F(ConnectionTableTest, RefusedClientsAreEndedFirst) {
    const Added& silent = addIn(Phase::idle);
    const Added& refused = addIn(Phase::refusal);
    const Added& trusted = addIn(Phase::body, true);
    add();
    EXPECT_FALSE(refused.isOpen());
    EXPECT_TRUE(silent.isOpen() && trusted.isOpen());
}

TEST_F(ConnectionTableTest, ClientsWhosePasswordIsCheckedAreEndedUnlessAnEarlierOneWasAccepted) {
    const Added& trusted = addIn(Phase::check, true);
    const Added& stranger = addIn(Phase::check);
    addIn(Phase::work);
    add().connection->enter(Phase::work);
    EXPECT_FALSE(stranger.isOpen());
    EXPECT_TRUE(stranger.connection->isEnding());
    EXPECT_TRUE(trusted.isOpen());
}

TEST_F(ConnectionTableTest, IdleConnectionsAreEndedBeforeThoseWithABody) {
    const Added& body = addIn(Phase::body, true);
    const Added& idle = addIn(Phase::idle, true);
    const Added& working = addIn(Phase::work, true);
    add().connection->enter(Phase::work);
    EXPECT_FALSE(idle.isOpen());
    add().connection->enter(Phase::check);
    EXPECT_FALSE(body.isOpen());
    EXPECT_TRUE(working.isOpen());
}

TEST_F(ConnectionTableTest, OperationsAndResponsesInProgressAreNotEnded) {
    limits.connectionsPerAddress = 10;
    addIn(Phase::work);
    addIn(Phase::check, true);
    addIn(Phase::response);
    EXPECT_TRUE(add().isOpen());
    for (const Added& each : all) {
        EXPECT_TRUE(each.isOpen());
    }
}

TEST_F(ConnectionTableTest, ConnectionsThatAreEndingDoNotCount) {
    addIn(Phase::idle);
    const Added& second = addIn(Phase::idle);
    addIn(Phase::idle);
    add();                                // ends the first
    table.remove(all.back().connection);  // leaves room
    add();
    EXPECT_TRUE(second.isOpen());
}

TEST_F(ConnectionTableTest, ANetworkWithTooManyConnectionsLosesOneOfThem) {
    limits.connections = 10;
    limits.connectionsPerAddress = 2;
    const Added& other = add("b");
    const Added& first = add("a");
    const Added& second = add("a");
    EXPECT_TRUE(first.isOpen());
    const Added& third = add("a");
    EXPECT_FALSE(first.isOpen());
    EXPECT_TRUE(other.isOpen() && second.isOpen() && third.isOpen());
}

TEST_F(ConnectionTableTest, ANetworkWithOnlyBusyConnectionsReceivesNoMore) {
    limits.connections = 10;
    limits.connectionsPerAddress = 2;
    addIn(Phase::work);
    addIn(Phase::work);
    EXPECT_FALSE(add("a").isOpen());
    EXPECT_TRUE(add("b").isOpen());
}

TEST_F(ConnectionTableTest, ATooSlowHeadEndsTheConnection) {
    const Added& slow = add();
    slow.sockets.client.send("POST / HT");
    pollfd arrived{slow.sockets.server.get(), POLLIN, 0};
    ASSERT_EQ(::poll(&arrived, 1, 30'000), 1);
    endOverdueAfter(0s);
    endOverdueAfter(9s);
    EXPECT_TRUE(slow.isOpen());
    endOverdueAfter(11s);
    EXPECT_THAT(slow.sockets.client.receive(), testing::StartsWith("HTTP/1.1 408 "));
    EXPECT_TRUE(slow.connection->hasTimedOut());
}

TEST_F(ConnectionTableTest, TheAgeOfAHeadBeginsWithItsFirstByte) {
    const Added& client = add();
    endOverdueAfter(100s);
    client.sockets.client.send("POST / HT");
    pollfd arrived{client.sockets.server.get(), POLLIN, 0};
    ASSERT_EQ(::poll(&arrived, 1, 30'000), 1);
    endOverdueAfter(101s);
    EXPECT_TRUE(client.isOpen());
    EXPECT_TRUE(client.connection->hasPartOfHead());
}

TEST_F(ConnectionTableTest, TheAgeOfAHeadIsIndependentOfThePrecedingRequest) {
    const Added& client = add();
    client.sockets.client.send("POST / HT");
    pollfd arrived{client.sockets.server.get(), POLLIN, 0};
    ASSERT_EQ(::poll(&arrived, 1, 30'000), 1);
    endOverdueAfter(0s);
    for (const Phase phase : {Phase::check, Phase::body, Phase::work, Phase::response, Phase::idle}) {
        client.connection->enter(phase);
    }
    EXPECT_FALSE(client.connection->hasPartOfHead());
    endOverdueAfter(11s);
    EXPECT_TRUE(client.isOpen());
}

TEST_F(ConnectionTableTest, EachPhaseExceptWorkHasATimeLimit) {
    limits.connections = 10;
    limits.connectionsPerAddress = 10;
    const Added& idle = addIn(Phase::idle);
    const Added& body = addIn(Phase::body);
    const Added& response = addIn(Phase::response);
    const Added& work = addIn(Phase::work);
    endOverdueAfter(29s);
    EXPECT_TRUE(body.isOpen());
    endOverdueAfter(31s);
    EXPECT_TRUE(body.sockets.client.receive().rfind("HTTP/1.1 408 ", 0) == 0);
    endOverdueAfter(299s);
    EXPECT_TRUE(response.isOpen());
    endOverdueAfter(301s);
    EXPECT_EQ(response.sockets.client.receive(), "");
    endOverdueAfter(599s);
    EXPECT_TRUE(idle.isOpen());
    endOverdueAfter(601s);
    EXPECT_EQ(idle.sockets.client.receive(), "");
    EXPECT_TRUE(work.isOpen());
}

TEST_F(ConnectionTableTest, ARefusalIsLimitedLikeAResponseAfterTheDelay) {
    limits.failureDelay = 20s;
    limits.responseTime = 10s;
    const Added& refused = addIn(Phase::refusal);
    endOverdueAfter(29s);
    EXPECT_TRUE(refused.isOpen());
    endOverdueAfter(31s);
    EXPECT_EQ(refused.sockets.client.receive(), "");
}

TEST_F(ConnectionTableTest, AHandshakeIsLimitedLikeAHeadAndIsNotPartOfOne) {
    const Added& slow = add("a", true);
    const Added& ready = add("b", true);
    for (const Added* each : {&slow, &ready}) {
        each->sockets.client.send("hello");
        pollfd arrived{each->sockets.server.get(), POLLIN, 0};
        ASSERT_EQ(::poll(&arrived, 1, 30'000), 1);
    }
    std::array<char, 5> read{};
    ASSERT_EQ(::recv(ready.sockets.server.get(), read.data(), read.size(), 0), 5);
    table.endHandshake(ready.sockets.server.get(), nullptr);
    endOverdueAfter(0s);
    endOverdueAfter(11s);
    EXPECT_FALSE(slow.isOpen());
    EXPECT_TRUE(ready.isOpen());
}

TEST_F(ConnectionTableTest, ARequestThatArrivesWithTheHandshakeIsPartOfAHead) {
    const Added& client = add("a", true);
    client.sockets.client.send("hello" + std::string(100, 'a'));
    std::array<char, 5> read{};
    std::array<char, 105> awaited{};
    ASSERT_EQ(::recv(client.sockets.server.get(), awaited.data(), awaited.size(), MSG_PEEK | MSG_WAITALL), 105);
    ASSERT_EQ(::recv(client.sockets.server.get(), read.data(), read.size(), 0), 5);
    table.endHandshake(client.sockets.server.get(), nullptr);
    EXPECT_TRUE(client.connection->hasPartOfHead());
}

TEST_F(ConnectionTableTest, AClosedConnectionHasNoPartOfAHead) {
    Added& closed = add();
    closed.sockets.client.close();
    pollfd ended{closed.sockets.server.get(), POLLIN, 0};
    ASSERT_EQ(::poll(&ended, 1, 30'000), 1);
    EXPECT_FALSE(closed.connection->hasPartOfHead());
    Added& incomplete = add();
    incomplete.sockets.client.send("POST");
    pollfd arrived{incomplete.sockets.server.get(), POLLIN, 0};
    ASSERT_EQ(::poll(&arrived, 1, 30'000), 1);
    EXPECT_TRUE(incomplete.connection->hasPartOfHead());
}

TEST_F(ConnectionTableTest, BusyConnectionsAreThoseWithARequestThatIsNotRefused) {
    limits.connections = 10;
    limits.connectionsPerAddress = 10;
    for (const Phase phase : {Phase::idle, Phase::refusal, Phase::body, Phase::work, Phase::response}) {
        addIn(phase);
    }
    EXPECT_EQ(table.size(), 5U);
    EXPECT_EQ(table.busy(), 3U);
}

TEST_F(ConnectionTableTest, EndingAConnectionEndsItsWaitAndItsRequest) {
    Connection& connection = *add().connection;
    std::thread waiting([&] { connection.waitUntil(Connection::Clock::now() + 1h); });
    table.endAll();
    waiting.join();
    EXPECT_FALSE(connection.enter(Phase::work));
    EXPECT_FALSE(connection.hasTimedOut());
    EXPECT_FALSE(add().isOpen());
}

}  // namespace
