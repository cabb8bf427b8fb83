#include <gtest/gtest.h>

#include "schema/Text.h"

namespace cimhost::test {
namespace {

class GoodDateTime : public testing::TestWithParam<const char*> {};
TEST_P(GoodDateTime, IsTaken) {
    EXPECT_TRUE(isDateTime(GetParam()));
}
INSTANTIATE_TEST_SUITE_P(Times, GoodDateTime,
                         testing::Values("20260131120000.000000+060", "20240229235959.999999-720",
                                         "00000101000000.000000+000", "20260131******.******+000",
                                         "2026**********.******+000", "20260131120000.123***+000",
                                         "**************.******+000"));
INSTANTIATE_TEST_SUITE_P(Intervals, GoodDateTime,
                         testing::Values("00000000000000.000000:000", "99999999235959.000000:000",
                                         "0000001012****.******:000"));

class BadDateTime : public testing::TestWithParam<const char*> {};
TEST_P(BadDateTime, IsRefused) {
    EXPECT_FALSE(isDateTime(GetParam()));
}
INSTANTIATE_TEST_SUITE_P(NotADate, BadDateTime,
                         testing::Values("20261301120000.000000+000", "20260001120000.000000+000",
                                         "20260132120000.000000+000", "20260431120000.000000+000",
                                         "20260229120000.000000+000", "21000229120000.000000+000",
                                         "20260131240000.000000+000", "20260131126000.000000+000",
                                         "20260131120060.000000+000", "00000000000000.000000-000"));
INSTANTIATE_TEST_SUITE_P(NotTheForm, BadDateTime,
                         testing::Values("", "2026-01-31", "20260131120000.000000+06", "20260131120000.000000+0600",
                                         "20260131120000,000000+060", "20260131120000.000000 060",
                                         "2026013112000x.000000+060", "20260131120000.00000x+060",
                                         "20260131120000.000000+0x0", "20260131120000.000000+***",
                                         "2026**31120000.000000+000", "202601311200**.000000+000",
                                         "2026013112000*.******+000", "20260131120000.1*0000+000",
                                         "00000001250000.000000:000", "00000001120000.000000:060"));

TEST(NoDateTime, IsNothingButZerosWithoutOffset) {
    EXPECT_TRUE(isNoDateTime("00000000000000.000000-000"));
    EXPECT_TRUE(isNoDateTime("00000000000000.000000+000"));
    EXPECT_FALSE(isNoDateTime("00000000000000.000000+060"));
    EXPECT_FALSE(isNoDateTime("00000000000000.000000:000"));
    EXPECT_FALSE(isNoDateTime(""));
}

}  // namespace
}  // namespace cimhost::test
