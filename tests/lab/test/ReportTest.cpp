#include <gmock/gmock.h>

#include "lab/load/Report.h"

namespace {

using cimhost::lab::OperationKind;
using cimhost::lab::percentile;
using cimhost::lab::Report;
using cimhost::lab::Statistics;
using cimhost::lab::WrongResponse;
using std::chrono::microseconds;
using testing::ElementsAre;
using testing::Pair;

WrongResponse wrong(std::optional<unsigned> client, std::size_t number, const char* kind) {
    return {client, number, "request", {kind, "this", "that"}};
}

TEST(Percentile, IsTheTimeThatThisShareDoesNotExceed) {
    std::vector<Statistics::Time> times;
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

TEST(Statistics, AddsTheFiguresOfClients) {
    Statistics all(10);
    Statistics one(10);
    one.count(OperationKind::get, microseconds(3), false);
    one.count(OperationKind::get, microseconds(5), true);
    one.note(wrong(1, 2, "value"));
    Statistics other(10);
    other.count(OperationKind::create, microseconds(1), true);
    other.note(wrong(2, 1, "status"));
    all.add(one);
    all.add(other);
    all.note(wrong(std::nullopt, 1, "deleted"));
    const Report report = reportOf(all, 2);
    EXPECT_EQ(report.all.requests, 3U);
    EXPECT_EQ(report.all.wrong, 2U);
    EXPECT_EQ(report.wrong, 3U) << "including the wrong response at the end";
    EXPECT_DOUBLE_EQ(report.all.perSecond, 1.5);
    EXPECT_DOUBLE_EQ(report.all.max, 5);
    ASSERT_EQ(report.operations.size(), 2U);
    EXPECT_EQ(report.operations[0].name, "create");
    EXPECT_EQ(report.operations[1].name, "get");
    EXPECT_EQ(report.operations[1].wrong, 1U);
    EXPECT_THAT(report.kinds, ElementsAre(Pair("deleted", 1), Pair("status", 1), Pair("value", 1)));
}

TEST(Statistics, DescribesTheFirstWrongResponses) {
    Statistics all(3);
    Statistics one(3);
    for (std::size_t number = 1; number <= 5; ++number) {
        one.note(wrong(2, number, "value"));
    }
    Statistics other(3);
    other.note(wrong(1, 2, "status"));
    all.add(one);
    all.add(other);
    all.note(wrong(std::nullopt, 1, "deleted"));
    const auto first = all.first();
    ASSERT_EQ(first.size(), 3U);
    EXPECT_EQ(first[0].number, 1U);
    EXPECT_EQ(first[1].client, 1U) << "same number, lower client";
    EXPECT_EQ(first[2].client, 2U);
    EXPECT_EQ(all.wrong(), 7U);
}

TEST(Statistics, TheRateIsZeroWithoutTime) {
    const Report report = reportOf(Statistics(1), 0);
    EXPECT_EQ(report.all.perSecond, 0);
    EXPECT_EQ(report.all.max, 0);
    EXPECT_TRUE(report.operations.empty());
}

}  // namespace
