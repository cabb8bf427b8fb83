#include "Gate.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <condition_variable>
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

TEST(TurnTest, AClosedGateLetsNobodyIn) {
    Gate gate;
    EXPECT_TRUE(gate.arrive());
    gate.depart();
    gate.close();
    EXPECT_FALSE(gate.arrive());
}

TEST(TurnTest, ClosingWaitsForAllWhoHaveArrivedAlsoForThoseInTheQueue) {
    Gate gate;
    Diary diary;
    std::vector<std::thread> threads;
    const auto request = [&](const std::string& name) {
        ASSERT_TRUE(gate.arrive());
        diary.note(name + " arrived");
        gate.enter();
        if (name == "first") {
            diary.note("inside");
            diary.await("closing");
            awaitQueue(gate, 1);
        }
        gate.leave();
        diary.note(name + " done");
        gate.depart();
    };
    threads.emplace_back(request, "first");
    diary.await("inside");
    threads.emplace_back(request, "second");
    diary.await("second arrived");
    threads.emplace_back([&] {
        diary.note("closing");
        gate.close();
        diary.note("closed");
    });
    join(threads);
    EXPECT_EQ(diary.all().back(), "closed");
    EXPECT_EQ(diary.all().size(), 7U);
}

TEST(TurnTest, ClosingDoesNotWaitForTheCallingThreadsOwnRequest) {
    Gate gate;
    ASSERT_TRUE(gate.arrive());
    gate.close();
    EXPECT_FALSE(gate.arrive());
    gate.depart();
}

}  // namespace
}  // namespace gatetest
