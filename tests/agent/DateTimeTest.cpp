#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>

#include "KO/DateTime.h"
#include "KO/Utils.h"

using KO::DateTime;
using KO::Utils;

namespace {

const std::string noDate = "00000000000000.000000-000";

std::string dateRoundTrip(const std::string& text) {
    return Utils::convertCIMDateTime(Utils::convertStringToDateTime(text));
}

}  // namespace

TEST(DateTime, IsInitiallyNoDate) {
    EXPECT_EQ(Utils::convertCIMDateTime(DateTime()), noDate);
}

TEST(DateTime, KeepsItsString) {
    for (const char* text : {"20240229123456.000789-330", "19700101000000.000000+000", "20240101000000.999999-000",
                             "99991231235959.000000+999", "00000101000000.000000+720"}) {
        EXPECT_EQ(dateRoundTrip(text), text);
    }
}

TEST(DateTime, IsNoDateIfTheStringIsInvalid) {
    for (const char* text : {"", "00000000000000.000000-000", "20230229000000.000000+000", "2024-02-29",
                             "20240229250000.000000+000", "00000010120000.000000:000"}) {
        EXPECT_EQ(dateRoundTrip(text), noDate) << text;
    }
}

TEST(DateTime, OfTheClockIsUtcUnlessLocalTimeIsRequested) {
    ::setenv("TZ", "EAST-05:45", 1);
    ::tzset();
    EXPECT_EQ(Utils::convertCIMDateTime(DateTime(1700000000, 3)), "20231115035820.000000+345");
    for (const unsigned int kind : {0U, 1U, 2U, 4U, 0xFFFFFFFFU}) {
        EXPECT_EQ(Utils::convertCIMDateTime(DateTime(1700000000, kind)), "20231114221320.000000+000");
    }
    ::setenv("TZ", "WEST03:30", 1);
    ::tzset();
    EXPECT_EQ(Utils::convertCIMDateTime(DateTime(1700000000, 3)), "20231114184320.000000-210");
    ::unsetenv("TZ");
    ::tzset();
}

TEST(DateTime, OutOfRangeSecondsAreNoDate) {
    EXPECT_EQ(Utils::convertCIMDateTime(DateTime(INT64_MAX, 3)), noDate);
    EXPECT_EQ(Utils::convertCIMDateTime(DateTime(INT64_MIN, 0)), noDate);
}

TEST(DateTime, CopiesAreIndependent) {
    DateTime original = Utils::convertStringToDateTime("20240229123456.000789-330");
    const DateTime copy = original;
    original = DateTime();
    EXPECT_EQ(Utils::convertCIMDateTime(copy), "20240229123456.000789-330");
    EXPECT_EQ(Utils::convertCIMDateTime(original), noDate);
}
