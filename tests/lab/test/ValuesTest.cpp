#include <gtest/gtest.h>

#include "cim/DateTime.h"
#include "lab/load/Values.h"
#include "model/Value.h"
#include "schema/MofWriter.h"
#include "support/Values.h"

namespace {

using cimhost::Property;
using cimhost::Value;
using cimhost::lab::canMakeValue;
using cimhost::lab::makeValue;
using cimhost::lab::Random;
using cimhost::lab::sameValue;

Property property(CMPIType type, bool isArray = false) {
    Property made;
    made.name = "P";
    made.type = type;
    made.isArray = isArray;
    return made;
}

class MadeValue : public testing::TestWithParam<CMPIType> {};

TEST_P(MadeValue, HasTheTypeAndIsTheSameForTheSameSeed) {
    const Property of = property(GetParam());
    ASSERT_TRUE(canMakeValue(of));
    Random random(7, 3);
    Random same(7, 3);
    for (int i = 0; i < 100; ++i) {
        const Value value = makeValue(of, random);
        EXPECT_EQ(value.type, GetParam());
        EXPECT_FALSE(value.isNull);
        EXPECT_TRUE(sameValue(value, makeValue(of, same)));
    }
}

INSTANTIATE_TEST_SUITE_P(Types, MadeValue,
                         testing::Values(CMPI_string, CMPI_dateTime, CMPI_boolean, CMPI_char16, CMPI_uint8, CMPI_uint16,
                                         CMPI_uint32, CMPI_uint64, CMPI_sint8, CMPI_sint16, CMPI_sint32, CMPI_sint64,
                                         CMPI_real32, CMPI_real64),
                         [](const auto& each) { return std::string(cimhost::typeName(each.param)); });

TEST(MadeValues, DoNotExistForOtherTypes) {
    EXPECT_FALSE(canMakeValue(property(CMPI_ref)));
    EXPECT_FALSE(canMakeValue(property(CMPI_instance)));
    EXPECT_FALSE(canMakeValue(property(CMPI_string, true)));
}

TEST(MadeValues, DatesAreValid) {
    Random random(1, 1);
    for (int i = 0; i < 1000; ++i) {
        const Value value = makeValue(property(CMPI_dateTime), random);
        EXPECT_TRUE(cim::isDateTime(std::get<cimhost::DateTime>(value.single).value));
    }
}

TEST(SameValue, ComparesTypesNullsAndContents) {
    EXPECT_TRUE(sameValue(testsupport::text("a"), testsupport::text("a")));
    EXPECT_FALSE(sameValue(testsupport::text("a"), testsupport::text("b")));
    EXPECT_FALSE(sameValue(testsupport::uint32(1), testsupport::uint64(1)));
    EXPECT_FALSE(sameValue(testsupport::text("NULL"), testsupport::nullOf(CMPI_string)));
    EXPECT_TRUE(sameValue(testsupport::nullOf(CMPI_string), testsupport::nullOf(CMPI_string)));
}

}  // namespace
