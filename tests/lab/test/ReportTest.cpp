#include "lab/load/Report.h"

#include <gmock/gmock.h>

namespace {

using cimhost::lab::Deed;
using cimhost::lab::percentile;
using cimhost::lab::Report;
using cimhost::lab::Tally;
using cimhost::lab::WrongAnswer;
using std::chrono::microseconds;
using testing::ElementsAre;
using testing::Pair;

WrongAnswer wrong(std::optional<unsigned> client, std::size_t number, const char* kind) {
    return {client, number, "request", {kind, "this", "that"}};
}

TEST(Percentile, IsTheTimeThatSoManyDoNotExceed) {
    std::vector<Tally::Time> times;
    EXPECT_EQ(percentile(times, 0.5), 0);
    for (int i = 1; i <= 200; ++i) {
        times.emplace_back(microseconds(i));
    }
    EXPECT_DOUBLE_EQ(percentile(times, 0.5), 100);
    EXPECT_DOUBLE_EQ(percentile(times, 0.95), 190);
    EXPECT_DOUBLE_EQ(percentile(times, 0.99), 198);
    EXPECT_DOUBLE_EQ(percentile(times, 1), 200);
    EXPECT_DOUBLE_EQ(percentile({microseconds(7)}, 0.01), 7);
}

TEST(Tally, AddsUp) {
    Tally all(10);
    Tally one(10);
    one.count(Deed::get, microseconds(3), false);
    one.count(Deed::get, microseconds(5), true);
    one.note(wrong(1, 2, "value"));
    Tally other(10);
    other.count(Deed::create, microseconds(1), true);
    other.note(wrong(2, 1, "status"));
    all.add(one);
    all.add(other);
    all.note(wrong(std::nullopt, 1, "ghost"));
    const Report report = reportOf(all, 2);
    EXPECT_EQ(report.all.requests, 3U);
    EXPECT_EQ(report.all.wrong, 2U);
    EXPECT_EQ(report.wrong, 3U) << "with what was found at the end";
    EXPECT_DOUBLE_EQ(report.all.perSecond, 1.5);
    EXPECT_DOUBLE_EQ(report.all.max, 5);
    ASSERT_EQ(report.deeds.size(), 2U);
    EXPECT_EQ(report.deeds[0].name, "create");
    EXPECT_EQ(report.deeds[1].name, "get");
    EXPECT_EQ(report.deeds[1].wrong, 1U);
    EXPECT_THAT(report.kinds, ElementsAre(Pair("ghost", 1), Pair("status", 1), Pair("value", 1)));
}

TEST(Tally, TellsTheFirstInWords) {
    Tally all(3);
    Tally one(3);
    for (std::size_t number = 1; number <= 5; ++number) {
        one.note(wrong(2, number, "value"));
    }
    Tally other(3);
    other.note(wrong(1, 2, "status"));
    all.add(one);
    all.add(other);
    all.note(wrong(std::nullopt, 1, "ghost"));
    const auto first = all.first();
    ASSERT_EQ(first.size(), 3U);
    EXPECT_EQ(first[0].number, 1U);
    EXPECT_EQ(first[1].client, 1U) << "same number, lower client";
    EXPECT_EQ(first[2].client, 2U);
    EXPECT_EQ(all.wrong(), 7U);
}

TEST(Tally, WithoutTimeThereIsNoRate) {
    const Report report = reportOf(Tally(1), 0);
    EXPECT_EQ(report.all.perSecond, 0);
    EXPECT_EQ(report.all.max, 0);
    EXPECT_TRUE(report.deeds.empty());
}

}  // namespace
