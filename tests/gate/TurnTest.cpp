#include "Gate.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <pthread.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <condition_variable>
#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

// Who is let in, and when.

namespace gatetest {
namespace {

using gate::Gate;
using testing::ElementsAre;
using testing::Le;

/** Events in the order in which they happen, and a way to wait for one. */
class Diary {
public:
    void note(const std::string& event) {
        const std::lock_guard<std::mutex> lock(mutex);
        events.push_back(event);
        changed.notify_all();
    }

    void await(const std::string& event) {
        std::unique_lock<std::mutex> lock(mutex);
        changed.wait(lock, [&] { return std::find(events.begin(), events.end(), event) != events.end(); });
    }

    std::vector<std::string> all() {
        const std::lock_guard<std::mutex> lock(mutex);
        return events;
    }

private:
    std::mutex mutex;
    std::condition_variable changed;
    std::vector<std::string> events;
};

/** For those who close a gate and are not to wait in vain: it ends no test that goes well. */
constexpr std::chrono::hours longEnough{1};

/** Goes on when so many wait at the gate. */
void awaitQueue(const Gate& gate, std::size_t length) {
    while (gate.waiting() < length) {
        std::this_thread::yield();
    }
}

void join(std::vector<std::thread>& threads) {
    for (std::thread& thread : threads) {
        thread.join();
    }
}

TEST(TurnTest, RequestsEnterInOrderOfArrival) {
    Gate gate;
    Diary diary;
    std::vector<std::thread> threads;
    gate.enter();
    for (std::size_t number = 0; number < 8; ++number) {
        threads.emplace_back([&, number] {
            gate.enter();
            diary.note(std::to_string(number));
            gate.leave();
        });
        awaitQueue(gate, number + 1);
    }
    gate.leave();
    join(threads);
    EXPECT_THAT(diary.all(), ElementsAre("0", "1", "2", "3", "4", "5", "6", "7"));
}

TEST(TurnTest, WhoComesBackAtOnceGoesBehindThoseWhoWait) {
    Gate gate;
    Diary diary;
    gate.enter();
    std::thread other([&] {
        gate.enter();
        diary.note("who waited");
        gate.leave();
    });
    awaitQueue(gate, 1);
    gate.leave();
    gate.enter();
    diary.note("who came back");
    gate.leave();
    other.join();
    EXPECT_THAT(diary.all(), ElementsAre("who waited", "who came back"));
}

TEST(TurnTest, NeverMoreThanOneIsInside) {
    Gate gate;
    int inside = 0;
    int most = 0;
    int total = 0;
    std::vector<std::thread> threads;
    for (int number = 0; number < 16; ++number) {
        threads.emplace_back([&] {
            for (int round = 0; round < 500; ++round) {
                gate.enter();
                most = std::max(most, ++inside);
                ++total;
                --inside;
                gate.leave();
            }
        });
    }
    join(threads);
    EXPECT_EQ(most, 1);
    EXPECT_EQ(total, 16 * 500);
}

TEST(TurnTest, DuringAPauseTheSameThreadAndOthersMayEnter) {
    Diary diary;
    const gate::Turn turn;
    diary.note("first in");
    {
        const gate::Pause pause;
        {
            const gate::Turn again;
            diary.note("same thread");
        }
        std::thread([&] {
            const gate::Turn other;
            diary.note("other thread");
        }).join();
    }
    diary.note("first again");
    EXPECT_THAT(diary.all(), ElementsAre("first in", "same thread", "other thread", "first again"));
}

TEST(TurnTest, WhoComesBackFromAPauseWaitsForWhoIsInside) {
    Diary diary;
    std::thread first;
    {
        const gate::Turn turn;
        first = std::thread([&] {
            const gate::Turn own;
            {
                const gate::Pause pause;
                diary.note("pausing");
                diary.await("other in");
            }
            diary.note("back");
        });
        awaitQueue(gate::theGate, 1);
    }
    diary.await("pausing");
    {
        const gate::Turn turn;
        diary.note("other in");
        awaitQueue(gate::theGate, 1);
        diary.note("other out");
    }
    first.join();
    EXPECT_THAT(diary.all(), ElementsAre("pausing", "other in", "other out", "back"));
}

/** Goes on when the gate closes, whether or not it is shut. */
void awaitClosing(Gate& gate) {
    while (gate.arrive()) {
        gate.depart();
        std::this_thread::yield();
    }
}

TEST(TurnTest, AClosedGateLetsNobodyIn) {
    Gate gate;
    EXPECT_TRUE(gate.arrive());
    gate.depart();
    EXPECT_TRUE(gate.close(longEnough));
    EXPECT_FALSE(gate.arrive());
    EXPECT_FALSE(gate.close(longEnough)) << "it was closed before";
}

TEST(TurnTest, ClosingWaitsForWhoIsInsideAndForThoseInTheQueue) {
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

TEST(TurnTest, ClosingHasNoPatienceWithWhoIsElsewhereAndWaitsForWhoIsInside) {
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

TEST(TurnTest, AGateThatClosesGivesNoNewTurns) {
    Gate gate;
    ASSERT_TRUE(gate.arrive());
    std::thread closer([&] { EXPECT_TRUE(gate.close(longEnough)); });
    awaitClosing(gate);
    EXPECT_FALSE(gate.enter());
    gate.depart();
    closer.join();
}

TEST(TurnTest, WhoComesBackFromAPauseWhileTheGateClosesIsServed) {
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

TEST(TurnTest, WhoComesBackToAShutGateWaitsForItToBeOpened) {
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

TEST(TurnTest, WhoResumesHasItsTurnAgainUnlessTheGateWasShut) {
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

TEST(TurnTest, WhoWaitsToResumeIsSentAwayByTheEndAndWhoComesBackIsNot) {
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

TEST(TurnTest, TheEndComesBeforeTheGateIsShutAndNobodyElseIsInside) {
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

TEST(TurnTest, WhoWaitedToCloseDoesNotShutAGateThatWasOpenedSince) {
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

TEST(TurnTest, OthersThanTheCallerAreToldOf) {
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

TEST(TurnTest, WhoWasNotLetInIsNotWaitedFor) {
    Gate gate;
    EXPECT_TRUE(gate.close(longEnough));
    std::thread([&] { EXPECT_FALSE(gate.arrive()); }).join();
    EXPECT_FALSE(gate.hasOthers());
}

TEST(TurnTest, AGateThatIsClosedForGoodIsNotOpenedAgain) {
    Gate gate;
    gate.close(longEnough);
    gate.close(longEnough, Gate::Closing::forGood);
    EXPECT_FALSE(gate.open());
    EXPECT_FALSE(gate.arrive());
}

TEST(TurnTest, SeveralMayCloseTheGateAtATimeAndOneOfThemDoes) {
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

TEST(TurnTest, ClosingDoesNotWaitForTheCallingThreadsOwnRequest) {
    Gate gate;
    ASSERT_TRUE(gate.arrive());
    ASSERT_TRUE(gate.enter());
    gate.close(longEnough);
    EXPECT_FALSE(gate.enter());
    gate.leave();
    gate.depart();
}

TEST(TurnTest, AForkedChildThatEndsWaitsForNobody) {
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

/** Takes a turn, and can be cancelled after it. */
void* takeTurn(void* diary) {
    {
        const gate::Turn turn;
        pthread_testcancel();
        static_cast<Diary*>(diary)->note("inside");
    }
    pthread_testcancel();
    return nullptr;
}

TEST(TurnTest, AThreadThatIsCancelledEndsAfterItsTurn) {
    Diary diary;
    pthread_t thread{};
    {
        const gate::Turn turn;
        ASSERT_EQ(pthread_create(&thread, nullptr, &takeTurn, &diary), 0);
        awaitQueue(gate::theGate, 1);
        pthread_cancel(thread);
    }
    void* result = nullptr;
    ASSERT_EQ(pthread_join(thread, &result), 0);
    EXPECT_EQ(result, PTHREAD_CANCELED);
    EXPECT_THAT(diary.all(), ElementsAre("inside"));
    const gate::Turn next;
    EXPECT_EQ(gate::theGate.waiting(), 0U) << "the turn was given back";
}

}  // namespace
}  // namespace gatetest
