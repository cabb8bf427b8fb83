#include "Diary.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <pthread.h>

#include <algorithm>
#include <string>
#include <thread>
#include <vector>

// Who is let in, and when.

namespace gatetest {
namespace {

using gate::Gate;
using testing::ElementsAre;

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
