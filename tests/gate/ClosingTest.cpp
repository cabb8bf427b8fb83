#include "Diary.h"
#include "Provider.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <functional>
#include <string>
#include <thread>
#include <vector>

// A gate that closes, is shut, and is opened again.

namespace gatetest {
namespace {

using gate::Gate;
using testing::ElementsAre;

/** Goes on when the gate closes, whether or not it is shut. */
void awaitClosing(Gate& gate) {
    while (gate.arrive()) {
        gate.depart();
        std::this_thread::yield();
    }
}

TEST(ClosingTest, AClosedGateLetsNobodyIn) {
    Gate gate;
    EXPECT_TRUE(gate.arrive());
    gate.depart();
    EXPECT_TRUE(gate.close(longEnough));
    EXPECT_FALSE(gate.arrive());
    EXPECT_FALSE(gate.close(longEnough)) << "it was closed before";
}

TEST(ClosingTest, ClosingWaitsForWhoIsInsideAndForThoseInTheQueue) {
    Gate gate;
    Diary diary;
    std::vector<std::thread> threads;
    const auto request = [&](const std::string& name) {
        gate.arrive();
        ASSERT_TRUE(gate.enter());
        diary.note(name + " inside");
        if (name == "first") {
            diary.await("go on");
        }
        diary.note(name + " done");
        gate.leave();
        gate.depart();
    };
    threads.emplace_back(request, "first");
    diary.await("first inside");
    threads.emplace_back(request, "second");
    awaitQueue(gate, 1);
    threads.emplace_back([&] {
        gate.close(longEnough);
        diary.note("closed");
    });
    awaitClosing(gate);
    EXPECT_THAT(diary.all(), ElementsAre("first inside"));
    diary.note("go on");
    join(threads);
    EXPECT_THAT(diary.all(),
                ElementsAre("first inside", "go on", "first done", "second inside", "second done", "closed"));
}

TEST(ClosingTest, ClosingHasNoPatienceWithWhoIsElsewhereAndWaitsForWhoIsInside) {
    Gate gate;
    Diary diary;
    gate.arrive();
    ASSERT_TRUE(gate.enter());
    std::thread closer([&] {
        gate.close(std::chrono::seconds(0));
        diary.note("closed");
    });
    awaitClosing(gate);
    diary.note("leaving");
    gate.leave();
    closer.join();
    EXPECT_THAT(diary.all(), ElementsAre("leaving", "closed")) << "before it departs";
    gate.depart();
}

TEST(ClosingTest, AGateThatClosesGivesNoNewTurns) {
    Gate gate;
    ASSERT_TRUE(gate.arrive());
    std::thread closer([&] { EXPECT_TRUE(gate.close(longEnough)); });
    awaitClosing(gate);
    EXPECT_FALSE(gate.enter());
    gate.depart();
    closer.join();
}

TEST(ClosingTest, WhoComesBackFromAPauseWhileTheGateClosesIsServed) {
    Gate gate;
    ASSERT_TRUE(gate.arrive());
    ASSERT_TRUE(gate.enter());
    gate.leave();
    std::thread closer([&] { EXPECT_TRUE(gate.close(longEnough)); });
    awaitClosing(gate);
    gate.comeBack();
    gate.leave();
    gate.depart();
    closer.join();
}

TEST(ClosingTest, WhoComesBackToAShutGateWaitsForItToBeOpened) {
    Gate gate;
    Diary diary;
    std::thread late([&] {
        gate.arrive();
        EXPECT_TRUE(gate.enter());
        gate.leave();
        diary.note("pausing");
        diary.await("shut");
        gate.comeBack();
        diary.note("back");
        gate.leave();
        gate.depart();
    });
    diary.await("pausing");
    EXPECT_TRUE(gate.close(std::chrono::seconds(0)));
    diary.note("shut");
    awaitQueue(gate, 1);
    diary.note("opened");
    gate.open();
    late.join();
    EXPECT_THAT(diary.all(), ElementsAre("pausing", "shut", "opened", "back"));
    EXPECT_TRUE(gate.arrive());
    gate.depart();
}

TEST(ClosingTest, WhoResumesHasItsTurnAgainUnlessTheGateWasShut) {
    Gate gate;
    ASSERT_TRUE(gate.arrive());
    ASSERT_TRUE(gate.enter());
    gate.leave();
    const std::size_t round = gate.round();
    EXPECT_TRUE(gate.resume(round));
    gate.leave();
    gate.depart();
    EXPECT_TRUE(gate.close(longEnough));
    EXPECT_FALSE(gate.resume(round));
    EXPECT_TRUE(gate.open());
    EXPECT_NE(gate.round(), round);
    EXPECT_FALSE(gate.resume(round)) << "it belongs to a manager that ended";
    EXPECT_TRUE(gate.enter()) << "who was sent away has no turn";
    gate.leave();
}

TEST(ClosingTest, WhoWaitsToResumeIsSentAwayByTheEndAndWhoComesBackIsNot) {
    Gate gate;
    Diary diary;
    std::vector<std::thread> threads;
    const auto request = [&](const std::string& name, const std::function<bool()>& again) {
        gate.arrive();
        EXPECT_TRUE(gate.enter());
        gate.leave();
        diary.note(name + " pausing");
        diary.await("ending");
        diary.note(name + (again() ? " back" : " away"));
        gate.depart();
    };
    threads.emplace_back(request, "first", [&] { return gate.resume(0); });
    threads.emplace_back(request, "second", [&] {
        gate.comeBack();
        gate.leave();
        return true;
    });
    diary.await("first pausing");
    diary.await("second pausing");
    EXPECT_TRUE(gate.close(std::chrono::seconds(0), Gate::Closing::untilOpened, [&] {
        diary.note("ending");
        awaitQueue(gate, 2);
    }));
    diary.await("first away");
    EXPECT_EQ(gate.waiting(), 1U);
    diary.note("opened");
    EXPECT_TRUE(gate.open());
    join(threads);
    EXPECT_EQ(diary.all().back(), "second back");
}

TEST(ClosingTest, TheEndComesBeforeTheGateIsShutAndNobodyElseIsInside) {
    Gate gate;
    Diary diary;
    std::thread paused([&] {
        gate.arrive();
        EXPECT_TRUE(gate.enter());
        gate.leave();
        diary.note("pausing");
        diary.await("ending");
        gate.comeBack();
        diary.note("back");
        gate.leave();
        gate.depart();
    });
    diary.await("pausing");
    EXPECT_TRUE(gate.close(std::chrono::seconds(0), Gate::Closing::untilOpened, [&] {
        diary.note("ending");
        awaitQueue(gate, 1);
        EXPECT_FALSE(gate.open()) << "it closes";
        EXPECT_FALSE(gate.enter());
        diary.note("ended");
    }));
    diary.note("opened");
    EXPECT_TRUE(gate.open());
    paused.join();
    EXPECT_THAT(diary.all(), ElementsAre("pausing", "ending", "ended", "opened", "back"));
}

TEST(ClosingTest, WhoWaitedToCloseDoesNotShutAGateThatWasOpenedSince) {
    Gate gate;
    ASSERT_TRUE(gate.arrive());
    std::atomic<int> ends{0};
    std::vector<std::thread> threads;
    for (int number = 0; number < 4; ++number) {
        threads.emplace_back([&] { gate.close(longEnough, Gate::Closing::untilOpened, [&] { ++ends; }); });
    }
    while (gate.closing() < 4) {
        std::this_thread::yield();
    }
    gate.depart();
    while (!gate.open()) {
        std::this_thread::yield();
    }
    join(threads);
    EXPECT_EQ(ends, 1);
    EXPECT_TRUE(gate.arrive());
    gate.depart();
}

TEST(ClosingTest, OthersThanTheCallerAreToldOf) {
    Gate gate;
    EXPECT_FALSE(gate.hasOthers());
    gate.arrive();
    EXPECT_FALSE(gate.hasOthers()) << "on this thread";
    std::thread([&] {
        EXPECT_TRUE(gate.hasOthers());
        gate.arrive();
    }).join();
    EXPECT_TRUE(gate.hasOthers());
    gate.depart();
}

TEST(ClosingTest, WhoWasNotLetInIsNotWaitedFor) {
    Gate gate;
    EXPECT_TRUE(gate.close(longEnough));
    std::thread([&] { EXPECT_FALSE(gate.arrive()); }).join();
    EXPECT_FALSE(gate.hasOthers());
}

TEST(ClosingTest, AGateThatIsClosedForGoodIsNotOpenedAgain) {
    Gate gate;
    gate.close(longEnough);
    gate.close(longEnough, Gate::Closing::forGood);
    EXPECT_FALSE(gate.open());
    EXPECT_FALSE(gate.arrive());
}

TEST(ClosingTest, SeveralMayCloseTheGateAtATimeAndOneOfThemDoes) {
    Gate gate;
    std::atomic<int> closedBy{0};
    ASSERT_TRUE(gate.arrive());
    std::vector<std::thread> threads;
    for (int number = 0; number < 4; ++number) {
        threads.emplace_back([&] { closedBy += gate.close(longEnough) ? 1 : 0; });
    }
    awaitClosing(gate);
    gate.depart();
    join(threads);
    EXPECT_EQ(closedBy, 1);
}

TEST(ClosingTest, ClosingDoesNotWaitForTheCallingThreadsOwnRequest) {
    Gate gate;
    ASSERT_TRUE(gate.arrive());
    ASSERT_TRUE(gate.enter());
    gate.close(longEnough);
    EXPECT_FALSE(gate.enter());
    gate.leave();
    gate.depart();
}

TEST(ClosingTest, AForkedChildThatEndsWaitsForNobody) {
    Gate gate;
    Diary diary;
    std::thread inside([&] {
        gate.arrive();
        EXPECT_TRUE(gate.enter());
        diary.note("inside");
        diary.await("forked");
        gate.leave();
        gate.depart();
    });
    diary.await("inside");
    const pid_t child = fork();
    if (child == 0) {
        alarm(60);  // the only thread here would wait for one that is not
        gate.close(longEnough);
        _exit(7);
    }
    int status = 0;
    EXPECT_EQ(waitpid(child, &status, 0), child);
    EXPECT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 7);
    diary.note("forked");
    inside.join();
}

TEST(ClosingTest, ARequestWhoseManagerHasEndedGetsNoProviderAndKeepsNoTurn) {
    const gate::Request late{nullptr, nullptr, nullptr, nullptr, gate::theGate.round() + 1};
    EXPECT_THROW(gate::Provider{late}, gate::Ended);
    const gate::Request inTime{nullptr, nullptr, nullptr, nullptr, gate::theGate.round()};
    EXPECT_THROW(gate::Provider{inTime}, gate::Failure) << "there is no manager";
    const gate::Turn next;
    EXPECT_EQ(gate::theGate.waiting(), 0U) << "both turns were given back";
}

}  // namespace
}  // namespace gatetest
