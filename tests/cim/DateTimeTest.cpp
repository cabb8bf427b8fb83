#include <gtest/gtest.h>

#include "cim/DateTime.h"

using cim::formatPointInTime;
using cim::isDateTime;
using cim::isInterval;
using cim::isPointInTime;

TEST(CimDateTime, AcceptsPointsInTimeOnDaysOfTheCalendar) {
    for (const char* text : {
             "20240229235959.999999+000",  // leap year
             "20000229000000.000000-720",  // leap year at the end of a century
             "00000101000000.000000+000",
             "99991231235959.999999+999",
             "20240101000000.123456-000",
         }) {
        EXPECT_TRUE(isPointInTime(text)) << text;
        EXPECT_FALSE(isInterval(text)) << text;
    }
}

TEST(CimDateTime, RejectsOtherStringsAsPointsInTime) {
    for (const char* text : {
             "",
             "00000000000000.000000-000",
             "20230229000000.000000+000",  // not a leap year
             "19000229000000.000000+000",  // not a leap year, at the end of a century
             "20240431000000.000000+000",
             "20241301000000.000000+000",
             "20240001000000.000000+000",
             "20240100000000.000000+000",
             "20240101240000.000000+000",
             "20240101006000.000000+000",
             "20240101000060.000000+000",
             "20240101000000.000000+00",
             "20240101000000.000000+0000",
             "20240101000000,000000+000",
             "20240101000000.000000 000",
             "20240101000000.000000:000",
             "2024010100000x.000000+000",
             "20240101******.******+000",
             " 0240101000000.000000+000",
         }) {
        EXPECT_FALSE(isPointInTime(text)) << text;
    }
    EXPECT_FALSE(isPointInTime(std::string_view("20240101000000.00000\0+000", 25)));
}

TEST(CimDateTime, DistinguishesIntervalsFromPointsInTime) {
    EXPECT_TRUE(isInterval("00000010120000.000000:000"));
    EXPECT_TRUE(isInterval("99999999235959.999999:000"));
    EXPECT_FALSE(isInterval("00000010240000.000000:000"));
    EXPECT_FALSE(isInterval("00000010120000.000000:001"));
    EXPECT_FALSE(isInterval("20240101000000.000000+000"));
}

TEST(CimDateTime, FormatsAPointInTimeWithAnOffset) {
    EXPECT_EQ(formatPointInTime(0, 0), "19700101000000.000000+000");
    EXPECT_EQ(formatPointInTime(1700000000, 0), "20231114221320.000000+000");
    EXPECT_EQ(formatPointInTime(1700000000, 345), "20231115035820.000000+345");
    EXPECT_EQ(formatPointInTime(1700000000, -210), "20231114184320.000000-210");
    EXPECT_EQ(formatPointInTime(-1, 0), "19691231235959.000000+000");
    EXPECT_EQ(formatPointInTime(0, 0, 1), "19700101000000.000001+000");
    EXPECT_EQ(formatPointInTime(-1, -210, 999999), "19691231202959.999999-210");
}

TEST(CimDateTime, FormatsNoYearsBelow0OrAbove9999) {
    EXPECT_EQ(formatPointInTime(253402300799, 0), "99991231235959.000000+000");
    EXPECT_EQ(formatPointInTime(253402300800, 0), "");
    EXPECT_EQ(formatPointInTime(-62167219200, 0), "00000101000000.000000+000");
    EXPECT_EQ(formatPointInTime(-62167219201, 0), "");
    EXPECT_EQ(formatPointInTime(INT64_MAX, 60), "");
    EXPECT_EQ(formatPointInTime(INT64_MIN, -60), "");
    EXPECT_EQ(formatPointInTime(0, 1000), "");
}

TEST(CimDateTime, AcceptsAsterisksInTheLastFields) {
    for (const char* string : {"20240101******.******+000", "20240101000000.123***-060", "20260131******.******+000",
                               "2026**********.******+000", "**************.******+000"}) {
        EXPECT_TRUE(isDateTime(string)) << string;
        EXPECT_FALSE(isPointInTime(string)) << string;
    }
    for (const char* string : {"00000010******.******:000", "0000001012****.******:000"}) {
        EXPECT_TRUE(isDateTime(string)) << string;
        EXPECT_FALSE(isInterval(string)) << string;
    }
}

TEST(CimDateTime, RejectsAsterisksInOtherPlaces) {
    for (const char* string : {"2024**01000000.000000+000", "202401010000**.000000+000", "2026013112000*.******+000",
                               "20260131120000.1*0000+000", "20260131120000.000000+***"}) {
        EXPECT_FALSE(isDateTime(string)) << string;
    }
}

TEST(CimDateTime, RejectsOtherStrings) {
    for (const char* string : {"", "2026-01-31", "20260131120000.000000+06", "20260131120000.000000+0600",
                               "20260131120000,000000+060", "20260131120000.000000 060", "2026013112000x.000000+060",
                               "20260131120000.00000x+060", "20260131120000.000000+0x0", "00000001250000.000000:000",
                               "00000001120000.000000:060", "21000229120000.000000+000", "00000000000000.000000-000"}) {
        EXPECT_FALSE(isDateTime(string)) << string;
    }
    EXPECT_TRUE(isDateTime("00000000000000.000000:000"));
}

TEST(CimDateTime, RecognizesTheRepresentationsOfNoDate) {
    EXPECT_TRUE(cim::isNoDate(cim::noDate));
    EXPECT_TRUE(cim::isNoDate("00000000000000.000000+000"));
    EXPECT_FALSE(cim::isNoDate("00000101000000.000000+000"));
    EXPECT_FALSE(cim::isNoDate("00000000000000.000000+060"));
    EXPECT_FALSE(cim::isNoDate("00000000000000.000000:000"));
    EXPECT_FALSE(cim::isNoDate(""));
}
